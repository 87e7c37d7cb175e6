# SPDX-License-Identifier: MIT
"""A block of a device under test beside that of the model."""

from __future__ import annotations

import copy
from dataclasses import dataclass
from typing import Any, Optional

import numpy as np
from numpy.typing import ArrayLike, NDArray

from ._checks import array_of
from ._decoder import Decoder
from ._trace import BlockTrace


@dataclass(frozen=True, eq=False)
class Expected:
    """A block that has gone into the device."""

    number: int
    soft: NDArray[Any]
    iterations: int
    bits: NDArray[np.uint8]
    tag: int


class Mismatch(AssertionError):
    """A block of the device under test is not what the model says.

    An AssertionError, which test frameworks count as a failed test. What there is no block for, as when one came out
    for which none has gone in, is None.
    """

    block: Optional[int] = None
    """the number of the block, in the order in which blocks went in, from 0"""
    bits: Optional[NDArray[Any]] = None
    """what came out, a character for each bit"""
    expected: Optional[NDArray[np.uint8]] = None
    """(K,) the bits of the model"""
    soft: Optional[NDArray[Any]] = None
    """(3, K + 4) the soft values that went in"""
    tag: Optional[int] = None
    """the tag that came out, where it was given"""
    _model: Optional[Decoder] = None
    _iterations = 0

    def trace(self) -> BlockTrace:
        """Decode the block again, in a decoder of its own, and keep every value of its passes.

        :raises ValueError: there is no block to trace

        >>> scoreboard = quarzel.Scoreboard(quarzel.Decoder(), iterations=4)
        >>> expected = scoreboard.expect(np.full((3, 44), -8, dtype=np.int8))
        >>> try:
        ...     scoreboard.check(1 - expected)
        ... except quarzel.Mismatch as mismatch:
        ...     mismatch.trace()
        <BlockTrace: block 0, K = 40, 8 passes>
        """
        if self.soft is None or self._model is None:
            raise ValueError("there is no block to trace: none has gone in for what this mismatch is about")
        with copy.copy(self._model) as decoder:
            return decoder.trace(self.soft, iterations=self._iterations)


def difference(expected: Expected, values: NDArray[Any], tag: Optional[int]) -> tuple[Optional[str], int]:
    """What is wrong with a block, or None, and its wrong bits."""
    K = len(expected.bits)
    if values.shape != (K,):
        return f"has {values.size} bits, the model gives {K}", 0
    right = expected.bits.astype("U1")
    wrong = np.flatnonzero(values != right)
    if wrong.size:
        first = wrong[0]
        text = f"bit {first} is {values[first]}, the model gives {right[first]}; {wrong.size} of {K} bits differ"
        return text, wrong.size
    if tag is not None and tag != expected.tag:
        return f"the tag is {tag}, the model gives {expected.tag}", 0
    return None, 0


def symbols(bits: ArrayLike) -> NDArray[Any]:
    """Each bit as a character, or as the text of what is not one."""
    if isinstance(bits, str):
        return np.array(list(bits), dtype="U1")
    array = np.frombuffer(bits, dtype=np.uint8) if isinstance(bits, bytes) else array_of("bits", bits)
    if array.size and array.dtype.kind not in "biuUO":
        raise TypeError(f"bits must be integers, booleans or text, not {array.dtype}; use bits.astype(numpy.uint8)")
    if array.ndim == 0:
        raise TypeError("bits is one value; give the K bits of the block, first bit first, or a text of them")
    return (array.astype(np.uint8) if array.dtype == bool else array).astype(str).reshape(-1)


def refuse_packed(values: NDArray[Any], K: int) -> None:
    """Eight bits to a byte are a mistake of the test bench, not of the device."""
    if values.size * 8 == K and not np.isin(values, ["0", "1"]).all() and np.char.isdecimal(values).all():
        raise ValueError(
            f"there are {values.size} bytes for {K} bits: the bits are packed; use numpy.unpackbits(bits) first"
        )
