# SPDX-License-Identifier: MIT
"""Traces as arrays and as text."""

import os
import subprocess

import numpy as np
import pytest

import quarzel

TOOL = os.environ["QUARZEL_TOOL"]


@pytest.fixture
def soft(captures):
    return np.load(captures / "k40.soft.npy")


def test_signals_have_their_shapes_and_decide_the_bits(soft):
    decoder = quarzel.Decoder(8)
    trace = decoder.trace(soft[0], iterations=3)
    assert np.array_equal(trace.bits, decoder.decode(soft[0], iterations=3))
    assert len(trace.passes) == 6
    last = trace.passes[-1]
    assert {name: values.shape for name, values in last.items()} == {
        "int": (43,), "a": (43, 8), "b": (43, 8), "g": (43, 4), "llr": (43,), "ext": (43,),
    }  # fmt: skip
    assert np.array_equal(last["llr"][:40] >= 0, trace.bits)
    assert np.array_equal(trace.inputs["code1_sys"][:40], soft[0, 0, :40])
    assert np.array_equal(trace.inputs["code2_par0"][:40], soft[0, 2, :40])


def test_text_is_that_of_the_tool(soft, captures, tmp_path):
    model = tmp_path / "model.txt"
    subprocess.run(
        [TOOL, "decode", captures / "k40.soft.npy", "--units", "8", "--trace", "4", "--trace-file", model],
        check=True, capture_output=True,
    )  # fmt: skip
    trace = quarzel.Decoder(8).trace(soft[0], iterations=6, passes=4)
    assert trace.text == model.read_text()
    (read,) = quarzel.read_trace(model)
    assert read.bits is None
    assert all(np.array_equal(read.passes[3][name], trace.passes[3][name]) for name in trace.passes[3])
    ours = tmp_path / "ours.txt"
    trace.save(ours)
    assert subprocess.run([TOOL, "trace-diff", model, ours], capture_output=True).returncode == 0


def test_blocks_are_counted_on(soft):
    decoder = quarzel.Decoder()
    decoder.decode(soft[:3])
    trace = decoder.trace(soft[3], passes=1)
    assert trace.block == 3
    assert len(trace.passes) == 1


def test_refuses_more_than_one_block_and_no_pass(soft):
    with pytest.raises(ValueError, match="one block"):
        quarzel.Decoder().trace(soft)
    with pytest.raises(ValueError, match="passes must be 1 or more"):
        quarzel.Decoder().trace(soft[0], passes=0)
    with pytest.raises(ValueError, match="iterations"):
        quarzel.Decoder().trace(soft[0], iterations=-1)


@pytest.mark.parametrize("damage", [lambda text: "", lambda text: text[:-30], lambda text: text.replace("itsSys", "its")])
def test_refuses_what_is_no_whole_trace(soft, tmp_path, damage):
    file = tmp_path / "trace.txt"
    file.write_text(damage(quarzel.Decoder().trace(soft[0], passes=1).text))
    with pytest.raises(ValueError, match="no (whole )?trace of the model"):
        quarzel.read_trace(file)
