# SPDX-License-Identifier: MIT
"""quarzel.lte: transport blocks through the whole chain and back."""

import signal

import numpy as np
import pytest
import standard_lte as standard
from conftest import soft_of

import quarzel
from quarzel import lte


def random_bits(rng, *shape):
    return rng.integers(0, 2, shape, dtype=np.uint8)


def size_of_cut(rng, C):
    least, most = (1, 6120) if C == 1 else ((C - 1) * 6120 - 23, C * 6120 - 24)
    return int(rng.integers(max(least, 6121) if C == 2 else least, most + 1))


@pytest.mark.parametrize("C", range(1, 14))
def test_a_transport_block_is_that_of_the_standard_and_comes_back(rng, C):
    A = size_of_cut(rng, C)
    scheme = str(rng.choice(list(standard.BITS_OF_SYMBOL)))
    layers, rv = int(rng.integers(1, 5)), int(rng.integers(4))
    unit = layers * standard.BITS_OF_SYMBOL[scheme]
    G = unit * (3 * A // unit + C)
    bits = random_bits(rng, 2, A)
    coded = lte.encode_transport_block(bits, G, scheme, layers, rv)
    assert coded.shape == (2, G) and coded.dtype == np.uint8
    assert np.array_equal(coded[0], standard.encode(bits[0], G, scheme, layers, rv)), (A, G, scheme, layers, rv)
    decided, ok, _ = lte.decode_transport_block(soft_of(coded), A, scheme, layers, rv, iterations=4)
    assert np.array_equal(decided, bits) and decided.dtype == np.uint8
    assert ok.shape == (2,) and ok.dtype == bool and ok.all()


@pytest.mark.parametrize("A, G, C", [(4264, 12876, 1), (7224, 21912, 2)])
def test_reference_measurement_channels_have_their_sizes(rng, A, G, C):
    bits = random_bits(rng, A)
    blocks, _ = lte.segment(np.concatenate([bits, lte.crc24a(bits)]))
    assert len(blocks) == C
    coded = lte.encode_transport_block(bits, G, "16qam" if C == 2 else "qpsk")
    decided, ok, _ = lte.decode_transport_block(soft_of(coded), A, "16qam" if C == 2 else "qpsk")
    assert np.array_equal(decided, bits) and ok


def test_the_chain_is_its_pieces(rng):
    """Many transport blocks at once, with noise, of two sizes of code blocks and filler."""
    A, G = 7900, 16000
    bits = random_bits(rng, 2, 70, A)
    coded = lte.encode_transport_block(bits, G)
    soft = (soft_of(coded) + rng.normal(0, 8, coded.shape)).round().clip(-128, 127).astype(np.int8)
    decided, ok, buffers = lte.decode_transport_block(soft, A, iterations=5, units=4, algorithm="max-star")
    assert decided.shape == bits.shape and ok.shape == (2, 70) and buffers.shape[:-1] == (2, 70)
    sizes, filler = standard.cut(A + 24)
    assert filler and len(set(sizes)) == 2
    decoder = quarzel.Decoder(4, "max-star")
    blocks = []
    for r, part in enumerate(np.split(soft, np.cumsum(standard.coded_sizes(len(sizes), G, 1, 2))[:-1], axis=-1)):
        streams = lte.rate_recover(part, sizes[r], filler=filler if r == 0 else 0)
        blocks.append(decoder.decode(streams, iterations=5))
    whole, _ = lte.desegment(blocks, A + 24)
    assert np.array_equal(decided, whole[..., :A])
    assert np.array_equal(ok, ~lte.crc24a(whole).any(axis=-1))


def test_transmissions_are_combined(rng):
    """Each of them alone sends fewer bits than the block has."""
    A, G = 1000, 800
    bits = random_bits(rng, 5, A)
    buffers = None
    for rv in (0, 2, 3, 1):
        soft = soft_of(lte.encode_transport_block(bits, G, rv=rv))
        given = None if buffers is None else buffers.copy()
        before = buffers
        decided, ok, buffers = lte.decode_transport_block(soft, A, rv=rv, buffers=buffers)
        if before is None:
            assert not ok.any()
        else:
            assert np.array_equal(before, given), "those that were given are not changed"
    assert ok.all() and np.array_equal(decided, bits)


def test_algorithms_have_names_and_numbers_and_no_blocks_are_none(rng):
    bits = random_bits(rng, 3, 100)
    soft = soft_of(lte.encode_transport_block(bits, 300), 1)
    for number, name in enumerate(quarzel.algorithms):
        named = lte.decode_transport_block(soft, 100, algorithm=name, units=2, iterations=1)
        numbered = lte.decode_transport_block(soft, 100, algorithm=number, units=2, iterations=1)
        assert all(np.array_equal(a, b) for a, b in zip(named, numbered))
    decided, ok, _ = lte.decode_transport_block(soft[:0], 100)
    assert decided.shape == (0, 100) and ok.shape == (0,)
    assert lte.encode_transport_block(bits[:0], 300).shape == (0, 300)


class Stopped(Exception):
    pass


def test_a_signal_ends_a_long_call():
    def stop(*_):
        raise Stopped

    before = signal.signal(signal.SIGALRM, stop)
    try:
        with pytest.raises(Stopped):
            signal.setitimer(signal.ITIMER_REAL, 0.01)
            lte.decode_transport_block(np.broadcast_to(np.int8(1), (2000, 12240)), 6120, iterations=15)
    finally:
        signal.setitimer(signal.ITIMER_REAL, 0)
        signal.signal(signal.SIGALRM, before)


BITS = np.zeros(100, np.uint8)
SOFT = np.zeros(300, np.int8)


@pytest.mark.parametrize(
    "call, error, text",
    [
        (lambda: lte.encode_transport_block(BITS, 0), ValueError, "G must be a number from 1 to 2147483647, not 0"),
        (lambda: lte.encode_transport_block(BITS, 301), ValueError,
         "coded bits must be a multiple of 2, not 301; the nearest: 300, 302"),
        (lambda: lte.encode_transport_block(np.zeros(6500, int), 2), ValueError, "need at least 4 coded bits, not 2"),
        (lambda: lte.encode_transport_block(BITS, 300, "8psk"), ValueError, "choose one of bpsk, qpsk"),
        (lambda: lte.encode_transport_block(BITS, 300, layers=0), ValueError, "layers must be a number from 1 to 4"),
        (lambda: lte.encode_transport_block(BITS, 300, rv=4), ValueError, "rv must be 0, 1, 2 or 3, not 4"),
        (lambda: lte.encode_transport_block(BITS[:0], 300), ValueError, "a transport block has at least 1 bit, not 0"),
        (lambda: lte.encode_transport_block(BITS + 2, 300), ValueError, "a bit must be 0 or 1"),
        (lambda: lte.decode_transport_block(SOFT, 0), ValueError, "A must be a number from 1"),
        (lambda: lte.decode_transport_block(SOFT[:0], 100), ValueError, "soft values of a transport block must be 1 or more"),
        (lambda: lte.decode_transport_block(SOFT[:299], 100), ValueError, "multiple of 2, not 299; the nearest: 298, 300"),
        (lambda: lte.decode_transport_block(SOFT + 0.5, 100), TypeError, r"use quarzel.quantise\(soft\)"),
        (lambda: lte.decode_transport_block(SOFT, 100, iterations=16), ValueError, "iterations must be a number from 1 to 15"),
        (lambda: lte.decode_transport_block(SOFT, 100, units=3), ValueError, "units must be 2, 4 or 8, not 3"),
        (lambda: lte.decode_transport_block(SOFT, 100, algorithm="log"), ValueError, "there is no algorithm 'log'"),
        (lambda: lte.decode_transport_block(SOFT, 100, buffers=lte.decode_transport_block(SOFT, 200)[2]), ValueError,
         "A = 100 bits have soft buffers of 388 values, not 684"),
        (lambda: lte.decode_transport_block(SOFT, 100, buffers=np.zeros((2, 388), np.int16)), ValueError,
         r"buffers of shape \(2, 388\) does not belong to blocks of shape \(\)"),
        (lambda: lte.decode_transport_block(SOFT, 100, buffers=np.zeros(388)), TypeError, "array of int16, not float64"),
    ],
)  # fmt: skip
def test_refuses_what_does_not_fit(call, error, text):
    with pytest.raises(error, match=text):
        call()
