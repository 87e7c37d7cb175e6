# SPDX-License-Identifier: MIT
"""The code of LTE: block sizes, interleaver, encoder, and how the core cuts a block."""

from __future__ import annotations

import operator
from typing import NamedTuple

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core

block_sizes: tuple[int, ...] = tuple(_core.block_sizes())
"""The 188 block sizes K of LTE in ascending order, 40 to 6144 (3GPP TS 36.212, Table 5.1.3-3)."""


class Segments(NamedTuple):
    """How a block is divided among the threads of a core. All numbers are trellis steps."""

    alpha: NDArray[np.int32]
    """(segments, 2): where each forward recursion starts, and the first step behind its end."""
    beta: NDArray[np.int32]
    """(windows, segments, 2): where the backward recursion of each window starts, and the step below its end,
    or 0 for the window that starts at step 0."""


def _size(K: int) -> int:
    """K as the extension takes it; the extension names the nearest sizes when K is not one."""
    return min(max(operator.index(K), 0), 2**32 - 1)


def qpp(K: int) -> NDArray[np.int32]:
    """The interleaver of block size K.

    Returns (K,) indices: the second constituent code takes information bit ``qpp(K)[i]`` at step i.
    """
    return _core.qpp(_size(K))


def segments(K: int, units: int) -> Segments:
    """How a core with 2, 4 or 8 processing units cuts a block of K information bits."""
    if units not in (2, 4, 8):
        raise ValueError(f"units must be 2, 4 or 8, not {units}")
    count, windows = _core.layout(_size(K), operator.index(units))
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
    :raises ValueError: K is not a block size; the text names the nearest ones
    """
    array = np.asarray(bits)
    if array.dtype.kind not in "biu":
        raise TypeError(f"bits must be integers or booleans, not {array.dtype}; use bits.astype(numpy.uint8)")
    if array.ndim == 0:
        raise ValueError("bits must be an array of K bits, or of blocks of K bits")
    if array.dtype != np.uint8:
        # What does not fit a byte must not become a bit by losing its upper part.
        array = np.where((array == 0) | (array == 1), array, 2).astype(np.uint8)
    code = _core.encode(np.ascontiguousarray(array.reshape(-1, array.shape[-1])))
    return code.reshape(*array.shape[:-1], *code.shape[1:])
