# SPDX-License-Identifier: MIT
"""Soft values: made of log-likelihood ratios, and on their way to the extension checked, never changed."""

from __future__ import annotations

import math
from typing import Any, NamedTuple, Optional

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import array_of, real


class SoftBlocks(NamedTuple):
    """Three streams of one type and layout, and the shape of the blocks before they became rows."""

    streams: tuple[NDArray[Any], NDArray[Any], NDArray[Any]]
    """each (blocks, K + 4)"""
    shape: tuple[int, ...]
    """of the blocks; () for a single one"""


def quantise(llr: ArrayLike, scale: float = _core.llr_scale) -> NDArray[np.int8]:
    """Turn log-likelihood ratios or samples into soft values: multiply, round to the nearest, clip to -128 ... 127.

    Positive means bit 1, here as in the soft values: ``llr = log(P(bit = 1) / P(bit = 0))``. Change the sign first
    where yours is the other way round. Halves are rounded to the even number. All hosts of the model have this
    function.

    :param llr: real numbers in an array of any shape; infinities become the ends of the range
    :param scale: units of 1/8 for a value of 1; the default, 4, is the best one for log-likelihood ratios. For
        samples of +1 and -1 with noise of the variance v it is 8 / v
    :raises TypeError: the values are masked, or not real numbers
    :raises ValueError: some are not a number (NaN), or the scale is not above 0

    >>> quarzel.quantise([-0.6, 0.0, 2.5, 1000.0])
    array([ -2,   0,  10, 127], dtype=int8)
    """
    array = array_of("llr", llr)
    if array.dtype.kind not in "fiu":
        raise TypeError(f"llr must hold real numbers, not {array.dtype}")
    floating = np.float32 if array.dtype == np.float32 else np.float64
    return _core.quantise(array.astype(floating, order="C", copy=False), real("scale", scale))


def soft_blocks(systematic: ArrayLike, parity1: Optional[ArrayLike], parity2: Optional[ArrayLike]) -> SoftBlocks:
    """The blocks of three arrays (..., K + 4), or of one array (..., 3, K + 4)."""
    first = _soft_array(systematic, "systematic")
    if parity1 is None and parity2 is None:
        if first.ndim < 2 or first.shape[-2] != 3:
            raise ValueError(
                f"one array of shape {first.shape} does not hold three streams; give systematic, parity1 and "
                "parity2, or one array of shape (..., 3, K + 4)"
            )
        streams = (first[..., 0, :], first[..., 1, :], first[..., 2, :])
    elif parity1 is None or parity2 is None:
        raise ValueError("one parity is missing; give systematic, parity1 and parity2")
    else:
        streams = (first, _soft_array(parity1, "parity1"), _soft_array(parity2, "parity2"))
    if not streams[0].shape == streams[1].shape == streams[2].shape:
        shapes = ", ".join(str(stream.shape) for stream in streams)
        raise ValueError(f"the three streams have the shapes {shapes}; they must have the same one")
    if streams[0].ndim == 0:
        raise ValueError("a stream must be an array of K + 4 soft values, or of blocks of them")
    return SoftBlocks(_rows(streams), streams[0].shape[:-1])


def _soft_array(values: ArrayLike, name: str) -> NDArray[Any]:
    array = array_of(name, values)
    if array.dtype.kind != "i" or array.dtype.itemsize > 4:
        remedy = (
            f"quantise log-likelihood ratios first: quarzel.quantise({name})"
            if array.dtype.kind == "f"
            else f"use {name}.astype(numpy.int8), or int16 or int32 where the values need it"
        )
        if not array.size:
            remedy = f"it is empty: give K + 4 soft values, or numpy.zeros({array.shape}, numpy.int8) for no blocks"
        raise TypeError(f"{name} must be int8, int16 or int32, not {array.dtype}; {remedy}")
    return array


def _rows(streams: tuple[NDArray[Any], ...]) -> tuple[NDArray[Any], NDArray[Any], NDArray[Any]]:
    """The streams as (blocks, K + 4) of one type and with the same strides, copied only when they must be."""
    shape = streams[0].shape
    dtype = np.result_type(*streams).newbyteorder("=")
    rows = [stream.reshape(math.prod(shape[:-1]), shape[-1]).astype(dtype, copy=False) for stream in streams]
    if len({row.strides for row in rows}) != 1 or not all(row.flags.aligned for row in rows):
        rows = list(np.stack(rows))
    systematic, parity1, parity2 = rows
    return systematic, parity1, parity2
