# SPDX-License-Identifier: MIT
"""CRC, segmentation and the turbo code with filler bits of LTE (3GPP TS 36.212, 5.1.1 to 5.1.3)."""

from __future__ import annotations

from typing import NamedTuple, Sequence

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import bit_array, rows_of, whole
from ._code import block_size

MAX_COUNT = 2**31 - 1
"""The most bits or values that an argument may ask for."""
NULL = 255
"""What stands for <NULL>, at filler bits, in code blocks and in the streams of the encoder."""


class CodeBlocks(NamedTuple):
    """What a transport block is cut into."""

    blocks: list[NDArray[np.uint8]]
    """(..., K_r) each, in the order of the standard"""
    filler: int
    """filler bits in front of block 0, which hold :data:`NULL`"""


def crc24a(bits: ArrayLike) -> NDArray[np.uint8]:
    """The parity bits of a transport block.

    :param bits: (..., A) bits; those of a block that ends with its parity bits, and is right, give 24 times 0
    :returns: (..., 24) bits

    >>> block = np.array([1, 0, 1, 1, 0], np.uint8)
    >>> sent = np.concatenate([block, quarzel.lte.crc24a(block)])
    >>> quarzel.lte.crc24a(sent).any()
    False
    """
    return _crc("crc24a", bits)


def crc24b(bits: ArrayLike) -> NDArray[np.uint8]:
    """The parity bits of a code block, as :func:`crc24a`.

    >>> quarzel.lte.crc24b([[0, 0], [0, 1]])[:, -5:].tolist()
    [[0, 0, 0, 0, 0], [0, 0, 0, 1, 1]]
    """
    return _crc("crc24b", bits)


def crc16(bits: ArrayLike) -> NDArray[np.uint8]:
    """The 16 parity bits of the shorter check, as :func:`crc24a`.

    >>> quarzel.lte.crc16([1]).nonzero()[0].tolist()
    [3, 10, 15]
    """
    return _crc("crc16", bits)


def crc8(bits: ArrayLike) -> NDArray[np.uint8]:
    """The 8 parity bits of the shortest check, as :func:`crc24a`.

    >>> quarzel.lte.crc8([1])
    array([1, 0, 0, 1, 1, 0, 1, 1], dtype=uint8)
    """
    return _crc("crc8", bits)


def segment(bits: ArrayLike) -> CodeBlocks:
    """Cut transport blocks, each with its CRC24A, into code blocks. When there are several, each gets a CRC24B.

    :param bits: (..., B) bits
    :returns: the blocks, and how many filler bits stand in front of the first

    >>> blocks, filler = quarzel.lte.segment(np.zeros((5, 6145), np.uint8))
    >>> [block.shape for block in blocks], filler
    ([(5, 3072), (5, 3136)], 15)
    """
    array = bit_array("bits", bits, "B bits")
    blocks, sizes, filler = _core.segment(rows_of(array))
    whole_shape = blocks.reshape(*array.shape[:-1], sum(sizes))
    return CodeBlocks(np.split(whole_shape, np.cumsum(sizes)[:-1], axis=-1), filler)


def desegment(blocks: Sequence[ArrayLike], B: int) -> tuple[NDArray[np.uint8], NDArray[np.bool_]]:
    """Put decoded code blocks together again.

    :param blocks: the decisions on the code blocks in order, each (..., K_r); what stands at filler bits does not matter
    :param B: bits of the transport block with its CRC
    :returns: (..., B) bits; and (..., C): whether the CRC24B of each code block holds, True where it has none
    :raises ValueError: the sizes of the blocks are not those that B bits are cut into; the text names these

    >>> blocks, _ = quarzel.lte.segment(np.ones(6145, np.uint8))
    >>> bits, ok = quarzel.lte.desegment(blocks, 6145)
    >>> bits.all(), ok
    (True, array([ True,  True]))
    """
    arrays = [bit_array(f"block {r}", block, "K bits") for r, block in enumerate(blocks)]
    B = whole("B", B, 1, MAX_COUNT)
    _core.check_sizes([array.shape[-1] for array in arrays], B)
    shape = arrays[0].shape[:-1]
    for r, array in enumerate(arrays):
        if array.shape[:-1] != shape:
            raise ValueError(
                f"block {r} has the leading shape {array.shape[:-1]}, block 0 {shape}; they must have the same one"
            )
    bits, ok = _core.desegment(rows_of(np.concatenate(arrays, axis=-1)), B)
    return bits.reshape(*shape, B), ok.astype(bool).reshape(*shape, len(arrays))


def turbo_encode(block: ArrayLike, filler: int = 0) -> NDArray[np.uint8]:
    """Encode code blocks that may begin with filler bits. Without any it is :func:`quarzel.encode`.

    :param block: (..., K) bits, of which the first ``filler`` may be anything
    :param filler: F; they count as 0
    :returns: (..., 3, K + 4) code bits: systematic, parity 1, parity 2, each with its four tail positions;
        :data:`NULL` for the systematic and the first parity bit of filler bits

    >>> quarzel.lte.turbo_encode(np.ones(40, np.uint8), filler=3)[:, :5].tolist()
    [[255, 255, 255, 1, 1], [255, 255, 255, 1, 0], [0, 1, 0, 1, 0]]
    """
    array = bit_array("block", block, "K bits")
    K = block_size(array.shape[-1])
    streams = _core.turbo_encode(rows_of(array), whole("filler", filler, 0, K - 1))
    return streams.reshape(*array.shape[:-1], *streams.shape[1:])


def _crc(name: str, bits: ArrayLike) -> NDArray[np.uint8]:
    array = bit_array("bits", bits, "bits")
    parity = _core.crc(name, rows_of(array))
    return parity.reshape(*array.shape[:-1], parity.shape[-1])
