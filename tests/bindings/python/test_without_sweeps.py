# SPDX-License-Identifier: MIT
"""A build without sweeps decodes all the same, and says what sweeps need."""

import os
import sys

import numpy as np
import pytest

import quarzel


@pytest.fixture
def without_sweeps(monkeypatch):
    if os.environ["QUARZEL_SWEEP"] == "ON":
        monkeypatch.setitem(sys.modules, "quarzel._sweep", None)


def test_sweeps_say_what_they_need(without_sweeps, tmp_path):
    file = tmp_path / "result.json"
    file.write_text("{}")
    needs = "has no sweeps; build it with -DQUARZEL_SWEEP=ON where fmt, MPFR, nlohmann_json, OpenSSL and Random123"
    with pytest.raises(ImportError, match=needs):
        quarzel.sweep(1.0)
    with pytest.raises(ImportError, match=needs):
        quarzel.SweepResult.read(file)


def test_decoding_does_without(without_sweeps):
    assert not quarzel.Decoder().decode(np.full((3, 44), -8, np.int8)).any()
