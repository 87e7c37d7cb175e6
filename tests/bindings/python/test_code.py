# SPDX-License-Identifier: MIT
"""Block sizes, interleaver, segments and encoder."""

import ast
from pathlib import Path

import numpy as np
import pytest

import quarzel
from quarzel import _core


def test_the_stub_names_what_the_extension_has():
    stub = ast.parse(Path(_core.__file__).with_name("_core.pyi").read_text())
    kinds = (ast.ClassDef, ast.FunctionDef)
    named = {node.name for node in stub.body if isinstance(node, kinds)}
    named |= {node.target.id for node in stub.body if isinstance(node, ast.AnnAssign)}
    assert named == {name for name in vars(_core) if not name.startswith("_")}


def test_there_are_188_sizes():
    assert len(quarzel.block_sizes) == 188
    assert (quarzel.block_sizes[0], quarzel.block_sizes[-1]) == (40, 6144)


@pytest.mark.parametrize("K", quarzel.block_sizes[::17])
def test_qpp_is_a_permutation_by_a_quadratic_polynomial(K):
    pi = quarzel.qpp(K).astype(np.int64)
    assert np.array_equal(np.sort(pi), np.arange(K))
    second_difference = np.diff(pi, n=2) % K
    assert (second_difference == second_difference[0]).all()


def test_qpp_of_40_is_that_of_the_standard():
    i = np.arange(40)
    assert np.array_equal(quarzel.qpp(40), (3 * i + 10 * i * i) % 40)


def test_segments_cover_every_step_once():
    for K in quarzel.block_sizes:
        for units in (2, 4, 8):
            alpha, beta = quarzel.segments(K, units)
            count = len(alpha)
            assert count & (count - 1) == 0 and count <= 4 * units
            assert [start for start, _ in alpha] == list(range(0, K, K // count))
            assert beta.shape[1:] == (count, 2)
    # Worked out by hand: 8 threads, segments of 128 steps, windows of 64.
    alpha, beta = quarzel.segments(1024, 2)
    assert alpha.tolist() == [[128 * i, 128 * (i + 1)] for i in range(8)]
    assert beta.shape == (2, 8, 2)


def test_refuses_sizes_and_units_that_are_no_numbers_of_the_core():
    for K in (40.0, "40", None):
        with pytest.raises(TypeError, match="K must be a block size, not .*; quarzel.block_sizes lists them"):
            quarzel.qpp(K)
    for units in (3, 2**40):
        with pytest.raises(ValueError, match=f"units must be 2, 4 or 8, not {units}"):
            quarzel.segments(40, units)


@pytest.mark.parametrize("K, nearest", [(41, "40, 48"), (-1, "40"), (10**12, "6144")])
def test_names_the_nearest_sizes(K, nearest):
    for call in (quarzel.qpp, lambda size: quarzel.segments(size, 2)):
        with pytest.raises(ValueError, match=f"no block size of {K} bits; the nearest: {nearest}$"):
            call(K)


def test_encode_gives_the_systematic_bits_and_the_parity_of_an_impulse():
    bits = np.zeros(40, np.uint8)
    bits[0] = 1
    code = quarzel.encode(bits)
    assert code.shape == (3, 44) and code.dtype == np.uint8
    assert np.array_equal(code[0, :40], bits)
    # (1 + D + D^3) / (1 + D^2 + D^3), and pi(0) = 0.
    assert code[1, :8].tolist() == [1, 1, 1, 1, 0, 0, 1, 0]
    assert code[2, 0] == 1


def test_encode_takes_batches_and_booleans(rng):
    bits = rng.integers(0, 2, (2, 3, 64))
    code = quarzel.encode(bits)
    assert code.shape == (2, 3, 3, 68)
    assert np.array_equal(code[1, 2], quarzel.encode(bits[1, 2].astype(bool)))


@pytest.mark.parametrize(
    "bits, error, text",
    [
        (np.zeros(40), TypeError, "not float64"),
        (np.full(40, 256), ValueError, "a bit must be 0 or 1"),
        (np.full(40, -1), ValueError, "a bit must be 0 or 1"),
        (np.zeros(41, np.uint8), ValueError, "nearest: 40, 48"),
        (np.uint8(1), ValueError, "array of K bits"),
        (np.zeros(0, np.uint8), ValueError, "no block size of 0 bits; the nearest: 40$"),
        (np.ma.zeros(40, np.uint8), TypeError, r"bits is a masked array, .* use bits\.filled\(0\)"),
        ([[0, 1], [1]], ValueError, "bits is not an array: its rows must have the same length"),
    ],
)
def test_encode_refuses_what_are_no_bits(bits, error, text):
    with pytest.raises(error, match=text):
        quarzel.encode(bits)
