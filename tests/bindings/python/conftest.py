# SPDX-License-Identifier: MIT
"""What the tests of the Python package share."""

import json
import os
import random
from pathlib import Path

import hypothesis
import numpy as np
import pytest

hypothesis.settings.register_profile("quick", max_examples=40, deadline=None, database=None, print_blob=True)
hypothesis.settings.load_profile("quick")

# A build without sweeps has nothing to simulate with.
collect_ignore = [] if os.environ["QUARZEL_SWEEP"] == "ON" else ["test_figure.py", "test_simulation.py"]


@pytest.fixture
def rng():
    """A random source; its seed is shown when a test fails, and QUARZEL_TEST_SEED sets it."""
    seed = int(os.environ.get("QUARZEL_TEST_SEED", random.randrange(2**32)))
    print(f"QUARZEL_TEST_SEED={seed}")
    return np.random.default_rng(seed)


@pytest.fixture
def captures():
    return Path(os.environ["QUARZEL_CAPTURES"])


@pytest.fixture
def tool():
    """The command line tool, with which results are compared where it has been built."""
    if "QUARZEL_TOOL" not in os.environ:
        pytest.skip("the tool has not been built")
    return os.environ["QUARZEL_TOOL"]


def stored_cases(name):
    """The lines of a file of stored cases."""
    lines = (Path(__file__).parents[2] / "data" / name).read_text().splitlines()
    return [json.loads(line) for line in lines]


def bits_of_hex(digits, count):
    """The first bits of hexadecimal digits, highest first."""
    return np.unpackbits(np.frombuffer(bytes.fromhex(digits), np.uint8))[:count]


def soft_of(code, amplitude=8):
    """Noiseless soft values of code bits."""
    return np.where(code, amplitude, -amplitude).astype(np.int8)
