# SPDX-License-Identifier: MIT
"""quarzel.lte: CRC, segmentation, turbo code with filler, rate matching and its inverse."""

import numpy as np
import pytest
import standard_lte as standard
from conftest import bits_of_hex, stored_cases

import quarzel
from quarzel import lte

CRCS = {"crc24a": lte.crc24a, "crc24b": lte.crc24b, "crc16": lte.crc16, "crc8": lte.crc8}


def random_bits(rng, *shape):
    return rng.integers(0, 2, shape, dtype=np.uint8)


def with_null(block):
    return np.where(block == -1, lte.NULL, block)


@pytest.mark.parametrize("name", CRCS)
def test_a_check_is_the_remainder_of_the_division(rng, name):
    for size in (1, 7, 8, 40, 1001):
        bits = random_bits(rng, 2, 3, size)
        parity = CRCS[name](bits)
        assert parity.shape == (2, 3, standard.POWERS[name][0]) and parity.dtype == np.uint8
        for place in np.ndindex(2, 3):
            assert np.array_equal(parity[place], standard.parity(name, bits[place]))
        assert not CRCS[name](np.concatenate([bits, parity], axis=-1)).any()


def sizes_of_cuts(rng):
    """For each number of code blocks the fewest and most bits, and some between."""
    for C in range(1, 14):
        least, most = (1, 6144) if C == 1 else (max((C - 1) * 6120 + 1, 6145), C * 6120)
        for B in (least, most, *rng.integers(least, most, 3)):
            yield C, int(B)


def test_segmentation_is_that_of_the_standard_and_goes_back(rng):
    for C, B in sizes_of_cuts(rng):
        bits = random_bits(rng, 2, B)
        blocks, filler = lte.segment(bits)
        assert len(blocks) == C
        for row in range(2):
            expected = standard.segments(bits[row])
            assert [len(block) for block in expected] == [block.shape[-1] for block in blocks]
            for block, right in zip(blocks, expected):
                assert np.array_equal(block[row], with_null(right)), B
        assert filler == np.count_nonzero(blocks[0][0] == lte.NULL)
        back, ok = lte.desegment(blocks, B)
        assert np.array_equal(back, bits) and ok.shape == (2, C) and ok.dtype == bool and ok.all()


def test_a_wrong_code_block_is_told_and_filler_does_not_matter(rng):
    bits = random_bits(rng, 6145)
    blocks, filler = lte.segment(bits)
    wrong = [blocks[0].copy(), blocks[1].copy()]
    wrong[0][:filler] = 1
    wrong[1][100] ^= 1
    back, ok = lte.desegment(wrong, 6145)
    assert ok.tolist() == [True, False]
    assert np.count_nonzero(back != bits) == 1


def test_filler_is_null_in_the_streams_and_counts_as_0(rng):
    for K in (40, 512, 6144):
        for filler in (0, 1, 24, K - 1):
            block = random_bits(rng, 3, K)
            marked = block.astype(int)
            marked[:, :filler] = -1
            streams = lte.turbo_encode(block, filler)
            assert streams.shape == (3, 3, K + 4) and streams.dtype == np.uint8
            assert np.array_equal(streams[1], with_null(standard.turbo(marked[1])))
        assert np.array_equal(lte.turbo_encode(block), quarzel.encode(block))


def test_the_published_coded_bits_come_out():
    for case in stored_cases("rate_matching.jsonl"):
        streams = quarzel.encode(bits_of_hex(case["bits"], case["K"]))
        coded = lte.rate_match(streams, case["E"], case["rv"], buffer_size=case["Ncb"])
        assert np.array_equal(coded, bits_of_hex(case["matched"], case["E"])), case["source"]


def test_the_published_circular_buffers_decode_to_their_bits():
    for case in stored_cases("circular_buffers.jsonl"):
        buffer = np.array(case["soft"], np.int16)
        streams = lte.rate_recover(np.zeros(1, np.int8), case["K"], buffer=buffer)
        assert np.array_equal(buffer, case["soft"])
        decoded = quarzel.Decoder(units=8).decode(streams, iterations=8)
        assert np.array_equal(decoded, bits_of_hex(case["hard"], case["K"])), case["source"]


def matchings(rng):
    """Some of all that rate matching may be asked for."""
    for K in (40, 104, 1024, 3136, 6144):
        for filler in (0, 17):
            whole = lte.whole_buffer_size(K)
            for size in (None, whole, int(rng.integers(whole // 3, whole))):
                for E in (1, 2, (size or whole) // 7, (size or whole) + 1, 2 * (size or whole)):
                    yield K, filler, size, E, int(rng.integers(4))


def test_rate_matching_selects_the_bits_of_the_standard(rng):
    for K, filler, size, E, rv in matchings(rng):
        streams = lte.turbo_encode(random_bits(rng, 2, K), filler)
        coded = lte.rate_match(streams, E, rv, size, filler)
        assert coded.shape == (2, E) and coded.dtype == np.uint8
        places, _ = standard.selection(K, filler, rv, E, size)
        assert np.array_equal(coded, streams.reshape(2, -1)[:, places]), (K, filler, size, E, rv)


@pytest.mark.parametrize("width", [2, 8, 12, 16])
def test_rate_recovery_adds_and_clips_in_the_order_of_the_standard(rng, width):
    low, high = -(2 ** (width - 1)), 2 ** (width - 1) - 1
    for K, filler, size, E, rv in matchings(rng):
        soft = rng.integers(low // 2, high // 2 + 1, (2, E)).astype(np.int16)
        places, entries = standard.selection(K, filler, rv, E, size)
        sums = np.zeros((2, 3 * (K + 4)), int)
        buffer = np.zeros((2, size or lte.whole_buffer_size(K)), np.int16)
        expected = np.zeros_like(buffer)
        for _ in range(2):
            period = len(np.unique(places))
            for first in range(0, E, period):
                now = places[first : first + period]
                sums[:, now] = np.clip(sums[:, now] + soft[:, first : first + period], low, high)
            expected[:, entries] = sums[:, places]
            streams = lte.rate_recover(soft, K, rv, size, filler, buffer, width)
            assert np.array_equal(buffer, expected), (K, filler, size, E, rv)
            right = np.clip(sums, -128, 127).reshape(2, 3, K + 4)
            right[:, :2, :filler] = -128
            assert streams.dtype == np.int8 and np.array_equal(streams, right)
        once = lte.rate_recover(soft.astype(">i2"), K, rv, size, filler, width=width)
        fresh = np.zeros_like(buffer)
        assert np.array_equal(once, lte.rate_recover(soft, K, rv, size, filler, fresh, width))


def test_a_buffer_may_lie_anywhere(rng):
    soft = rng.integers(-9, 10, (2, 3, 100), dtype=np.int8)
    plain = np.zeros((2, 3, lte.whole_buffer_size(40)), np.int16)
    strided = np.zeros((2, 6, 2 * plain.shape[-1]), ">i2")[:, ::2, ::2]
    for rv in (0, 3):
        streams = lte.rate_recover(soft, 40, rv, buffer=plain)
        assert np.array_equal(lte.rate_recover(soft, 40, rv, buffer=strided), streams)
    assert np.array_equal(strided, plain)


CODE = quarzel.encode(np.zeros(40, np.uint8))
SOFT = np.zeros(100, np.int8)


@pytest.mark.parametrize(
    "call, error, text",
    [
        (lambda: lte.crc24a([0.5]), TypeError, "bits must be integers or booleans, not float64"),
        (lambda: lte.crc24a([0, 2]), ValueError, "a bit must be 0 or 1"),
        (lambda: lte.crc24b(1), ValueError, "bits must be an array of bits"),
        (lambda: lte.segment(np.zeros(0, np.uint8)), ValueError, "at least 1 bit to cut into code blocks, not 0"),
        (lambda: lte.segment([2]), ValueError, "a bit must be 0 or 1"),
        (lambda: lte.segment(1), ValueError, "an array of B bits"),
        (lambda: lte.desegment([], 40), ValueError, "cut into 1 code blocks, 1 of 40 bits; these have none"),
        (lambda: lte.desegment([np.zeros(48, int)], 40), ValueError, "1 of 40 bits; these have 48"),
        (lambda: lte.desegment([np.zeros(3072, int)] * 2, 6145), ValueError,
         "B = 6145 bits are cut into 2 code blocks, 1 of 3072 bits, then 1 of 3136 bits; these have 3072, 3072"),
        (lambda: lte.desegment([np.zeros((2, 3072), int), np.zeros(3136, int)], 6145), ValueError,
         r"block 1 has the leading shape \(\), block 0 \(2,\)"),
        (lambda: lte.desegment([np.full(40, 3)], 40), ValueError, "a bit must be 0 or 1"),
        (lambda: lte.desegment([np.zeros(40, int)], 0), ValueError, "B must be a number from 1"),
        (lambda: lte.turbo_encode(np.zeros(41, int)), ValueError, "no block size of 41 bits; the nearest: 40, 48"),
        (lambda: lte.turbo_encode(np.zeros(40, int), 40), ValueError, "filler must be a number from 0 to 39, not 40"),
        (lambda: lte.turbo_encode(lte.turbo_encode(np.zeros(40, int), 4)[0, :40], 3), ValueError, "must be 0 or 1"),
        (lambda: lte.whole_buffer_size(41), ValueError, "the nearest: 40, 48"),
        (lambda: lte.rate_match(CODE, 0), ValueError, "E must be a number from 1 to 2147483647, not 0"),
        (lambda: lte.rate_match(CODE, 1.5), TypeError, "E must be a whole number, not float"),
        (lambda: lte.rate_match(CODE, 10, rv=4), ValueError, "rv must be 0, 1, 2 or 3, not 4"),
        (lambda: lte.rate_match(CODE, 10, buffer_size=193), ValueError, "has 2 to 192 entries, not 193"),
        (lambda: lte.rate_match(CODE, 10, filler=40), ValueError, "0 to 39 filler bits, not 40"),
        (lambda: lte.rate_match(CODE[:2], 10), ValueError, r"the shape \(..., 3, K \+ 4\), not \(2, 44\)"),
        (lambda: lte.rate_match(CODE[:, 1:], 10), ValueError, r"streams of 43 .* nearest that have one: 44 \(K = 40\)"),
        (lambda: lte.rate_match(lte.turbo_encode(np.zeros(40, int), 8), 192), ValueError, "give filler = F"),
        (lambda: lte.rate_recover(SOFT[:0], 40), ValueError, "E must be a number from 1 to 2147483647, not 0"),
        (lambda: lte.rate_recover(SOFT, 41), ValueError, "the nearest: 40, 48"),
        (lambda: lte.rate_recover(SOFT, 40, rv=-1), ValueError, "rv must be 0, 1, 2 or 3, not -1"),
        (lambda: lte.rate_recover(SOFT, 40, width=1), ValueError, "width must be a number from 2 to 16, not 1"),
        (lambda: lte.rate_recover(SOFT, 40, buffer_size=1), ValueError, "has 2 to 192 entries, not 1"),
        (lambda: lte.rate_recover(SOFT.astype(float), 40), TypeError, r"not float64; use quarzel.quantise\(soft\)"),
        (lambda: lte.rate_recover(SOFT.astype(int), 40), TypeError, r"not int64; use soft.astype\(numpy.int16\)"),
        (lambda: lte.rate_recover(SOFT, 40, buffer=np.zeros(288, np.int16)), ValueError,
         "must be 192 entries in the circular buffer, not 288"),
        (lambda: lte.rate_recover(SOFT, 40, buffer=np.zeros((2, 192), np.int16)), ValueError,
         r"buffer of shape \(2, 192\) does not belong to blocks of shape \(\)"),
        (lambda: lte.rate_recover(SOFT, 40, buffer=np.zeros(192)), TypeError, "array of int16, not float64"),
        (lambda: lte.rate_recover(SOFT, 40, buffer=[0] * 192), TypeError, "array of int16, not list"),
    ],
)  # fmt: skip
def test_refuses_what_does_not_fit(call, error, text):
    with pytest.raises(error, match=text):
        call()
