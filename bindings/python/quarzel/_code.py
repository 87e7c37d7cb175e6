# SPDX-License-Identifier: MIT
"""The code of LTE: block sizes, interleaver, encoder, and how the core cuts a block."""

from __future__ import annotations

import bisect
import operator
from typing import NamedTuple

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import bit_array, choice, rows_of
from ._types import Units

block_sizes: tuple[int, ...] = tuple(_core.block_sizes())
"""The 188 block sizes K of LTE in ascending order, 40 to 6144 (3GPP TS 36.212, Table 5.1.3-3)."""


class Segments(NamedTuple):
    """How a block is divided among the threads of a core. All numbers are trellis steps."""

    alpha: NDArray[np.int32]
    """(segments, 2): where each forward recursion starts, and the first step behind its end."""
    beta: NDArray[np.int32]
    """(windows, segments, 2): where the backward recursion of each window starts, and the step below its end,
    or 0 for the window that starts at step 0."""


def block_size(K: int) -> int:
    """K, when it is a block size."""
    try:
        number = operator.index(K)
    except TypeError:
        raise TypeError(f"K must be a block size, not {type(K).__name__}; quarzel.block_sizes lists them") from None
    place = bisect.bisect_left(block_sizes, number)
    if number not in block_sizes[place : place + 1]:
        nearest = ", ".join(map(str, block_sizes[max(place - 1, 0) : place + 1]))
        raise ValueError(f"there is no block size of {number} bits; the nearest: {nearest}")
    return number


def qpp(K: int) -> NDArray[np.int32]:
    """The interleaver of block size K.

    :returns: (K,) indices: the second constituent code takes information bit ``qpp(K)[i]`` at step i
    :raises ValueError: K is not a block size; the text names the nearest ones

    >>> quarzel.qpp(40)[:6].tolist()
    [0, 13, 6, 19, 12, 25]
    """
    return _core.qpp(block_size(K))


def segments(K: int, units: Units) -> Segments:
    """How a core with 2, 4 or 8 processing units cuts a block of K information bits.

    >>> quarzel.segments(1024, units=2).alpha[:2].tolist()
    [[0, 128], [128, 256]]
    """
    count, windows = _core.layout(block_size(K), choice("units", units, (2, 4, 8)))
    lengths = np.array(windows, dtype=np.int32)
    tops = np.cumsum(lengths, dtype=np.int32)
    starts = np.arange(count, dtype=np.int32) * tops[-1]
    alpha = np.stack([starts, starts + tops[-1]], axis=-1)
    bottoms = (tops - lengths)[:, None] + starts
    beta = np.stack([tops[:, None] + starts - 1, np.maximum(bottoms - 1, 0)], axis=-1)
    return Segments(alpha, beta)


def encode(bits: ArrayLike) -> NDArray[np.uint8]:
    """Encode blocks.

    :param bits: (..., K) information bits, integers or booleans of value 0 or 1
    :returns: (..., 3, K + 4) code bits: systematic, parity 1, parity 2, each with its four tail positions
    :raises TypeError: the bits are not integers or booleans, or are masked
    :raises ValueError: K is not a block size; the text names the nearest ones

    >>> quarzel.encode(np.ones((5, 40), dtype=np.uint8)).shape
    (5, 3, 44)
    """
    array = bit_array("bits", bits, "K bits")
    block_size(array.shape[-1])
    code = _core.encode(rows_of(array))
    return code.reshape(*array.shape[:-1], *code.shape[1:])
