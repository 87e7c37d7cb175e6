# SPDX-License-Identifier: MIT
"""Compare a device under test with the model, block by block."""

from __future__ import annotations

from collections import deque
from dataclasses import dataclass
from typing import Any, Optional

import numpy as np
from numpy.typing import ArrayLike, NDArray

from ._soft import soft_blocks
from .decoder import Decoder


class Mismatch(AssertionError):
    """A block of the device under test is not what the model says.

    An AssertionError, which test frameworks count as a failed test.
    """


@dataclass(frozen=True)
class _Expected:
    """A block that has gone into the device."""

    number: int
    bits: NDArray[np.uint8]
    tag: int


class Scoreboard:
    """Keeps what the device under test must give back, and checks what it does give back.

    Blocks come out in the order in which they went in. It needs no simulator: the coroutines of a test bench
    call :meth:`expect` where they drive the inputs and :meth:`check` where they see the outputs.

    :param decoder: the model of the device
    :param iterations: iterations of a block, unless :meth:`expect` says otherwise
    :param stop_at_first: raise :class:`Mismatch` at the first block that differs; otherwise count, and let
        :meth:`finish` raise
    """

    def __init__(self, decoder: Decoder, iterations: int = 6, *, stop_at_first: bool = True) -> None:
        self.decoder = decoder
        self.iterations = iterations
        self.stop_at_first = stop_at_first
        self.blocks = 0
        """blocks checked"""
        self.block_errors = 0
        """blocks that differed"""
        self.bit_errors = 0
        """bits that differed"""
        self.first_mismatch: Optional[str] = None
        self._waiting: deque[_Expected] = deque()
        self._sent = 0

    @property
    def waiting(self) -> int:
        """Blocks that have gone in and not come out."""
        return len(self._waiting)

    def expect(
        self,
        systematic: ArrayLike,
        parity1: Optional[ArrayLike] = None,
        parity2: Optional[ArrayLike] = None,
        *,
        iterations: Optional[int] = None,
        tag: int = 0,
    ) -> NDArray[np.uint8]:
        """A block goes into the device: three streams of K + 4 soft values as for :meth:`Decoder.decode`.

        :returns: (K,) the bits that must come out
        """
        shape = soft_blocks(systematic, parity1, parity2).shape
        if shape != ():
            raise ValueError(f"expect takes one block, not blocks of shape {shape}; call it for each")
        count = self.iterations if iterations is None else iterations
        bits, tags = self.decoder.decode(systematic, parity1, parity2, count, tags=tag)
        self._waiting.append(_Expected(self._sent, bits, int(tags)))
        self._sent += 1
        return bits

    def check(self, bits: ArrayLike, tag: Optional[int] = None) -> bool:
        """A block comes out of the device.

        :param bits: (K,) values of 0 and 1, or a text of them such as ``str`` of a logic vector gives, first
            bit first; what is neither 0 nor 1 (an X for instance) is a difference
        :param tag: the tag that came with it; not compared when it is not given
        :returns: whether the block is right
        :raises Mismatch: it is not, and the scoreboard stops at the first
        """
        if not self._waiting:
            return self._fail(f"block {self.blocks}: came out, but no block has gone in for it", 0)
        expected = self._waiting.popleft()
        problem, wrong = _difference(expected, bits, tag)
        if problem is not None:
            return self._fail(f"block {expected.number}: {problem}", wrong)
        self.blocks += 1
        return True

    def finish(self) -> None:
        """The end of the test.

        :raises Mismatch: blocks differed, or some have not come out
        """
        if self.block_errors:
            raise Mismatch(
                f"{self.block_errors} of {self.blocks} blocks differ, in {self.bit_errors} bits; "
                f"first {self.first_mismatch}"
            )
        if self._waiting:
            raise Mismatch(
                f"{self.waiting} of {self._sent} blocks have not come out, "
                f"the first is block {self._waiting[0].number}"
            )

    def _fail(self, text: str, wrong_bits: int) -> bool:
        self.blocks += 1
        self.block_errors += 1
        self.bit_errors += wrong_bits
        self.first_mismatch = self.first_mismatch or text
        if self.stop_at_first:
            raise Mismatch(text)
        return False


def _difference(expected: _Expected, bits: ArrayLike, tag: Optional[int]) -> tuple[Optional[str], int]:
    """What is wrong with a block, or None, and its wrong bits."""
    values = _symbols(bits)
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


def _symbols(bits: ArrayLike) -> NDArray[Any]:
    """Each bit as a character."""
    if isinstance(bits, str):
        return np.array(list(bits), dtype="U1")
    array = np.asarray(bits)
    return (array.astype(np.uint8) if array.dtype == bool else array).astype(str).reshape(-1)
