# SPDX-License-Identifier: MIT
"""Compare a device under test with the model, block by block."""

from __future__ import annotations

from typing import Any, Optional

import numpy as np
from numpy.typing import ArrayLike, NDArray

from ._checks import whole
from ._decoder import Decoder
from ._mismatch import Expected, Mismatch, difference, refuse_packed, symbols
from ._soft import soft_blocks

_ATTRIBUTES = ("decoder", "iterations", "stop_at_first", "by_tag", "blocks", "block_errors", "bit_errors",
               "first_mismatch", "_waiting", "_sent")  # fmt: skip


class Scoreboard:
    """Keeps what the device under test must give back, and checks what it does give back.

    Blocks come out in the order in which they went in, or by their tags. It needs no simulator: the coroutines of a
    test bench call :meth:`expect` where they drive the inputs and :meth:`check` where they see the outputs.

    :param decoder: the model of the device
    :param iterations: iterations of a block, unless :meth:`expect` says otherwise
    :param stop_at_first: raise :class:`Mismatch` at the first block that differs; otherwise count, and let
        :meth:`finish` raise
    :param by_tag: blocks may come out in any order; their tags tell which they are. Those of the same tag come out in
        the order in which they went in

    >>> scoreboard = quarzel.Scoreboard(quarzel.Decoder(units=2), iterations=6)
    >>> expected = scoreboard.expect(np.full((3, 44), -8, dtype=np.int8))
    >>> scoreboard.check("0" * 40)
    True
    >>> scoreboard.finish()
    """

    def __init__(
        self, decoder: Decoder, iterations: int = 6, *, stop_at_first: bool = True, by_tag: bool = False
    ) -> None:
        if not isinstance(decoder, Decoder):
            raise TypeError(f"decoder must be a quarzel.Decoder, not {type(decoder).__name__}")
        if by_tag and decoder.tag_width in (0, 32):
            raise ValueError(
                f"a decoder with tag_width={decoder.tag_width} gives every tag back as 0; to match by tags, give it "
                "the device's width, from 1 to 31"
            )
        self.decoder = decoder
        self.iterations = whole("iterations", iterations, 1, 15)
        self.stop_at_first = stop_at_first
        self.by_tag = by_tag
        self.blocks = 0
        """blocks checked"""
        self.block_errors = 0
        """blocks that differed"""
        self.bit_errors = 0
        """bits that differed"""
        self.first_mismatch: Optional[Mismatch] = None
        self._waiting: list[Expected] = []
        self._sent = 0

    def __setattr__(self, name: str, value: object) -> None:
        if type(self) is Scoreboard and name not in _ATTRIBUTES:
            names = ", ".join(attribute for attribute in _ATTRIBUTES if not attribute.startswith("_"))
            raise AttributeError(f"{name} cannot be set; a scoreboard has {names}")
        super().__setattr__(name, value)

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

        >>> scoreboard = quarzel.Scoreboard(quarzel.Decoder())
        >>> scoreboard.expect(np.full((3, 44), 8, dtype=np.int8), tag=3).shape
        (40,)
        """
        blocks = soft_blocks(systematic, parity1, parity2)
        if blocks.shape != ():
            raise ValueError(f"expect takes one block, not blocks of shape {blocks.shape}; call it for each")
        soft = np.concatenate(blocks.streams)
        count = whole("iterations", self.iterations if iterations is None else iterations, 1, 15)
        bits, tags = self.decoder.decode(soft, iterations=count, tags=whole("tag", tag, 0, 0xFFFFFFFF))
        self._waiting.append(Expected(self._sent, soft, count, bits, int(tags)))
        self._sent += 1
        return bits.copy()

    def check(self, bits: ArrayLike, tag: Optional[int] = None) -> bool:
        """A block comes out of the device.

        :param bits: (K,) integers or booleans, or a text of them such as ``str`` of a logic vector gives, first bit
            first; what is neither 0 nor 1 (an X for instance) is a difference
        :param tag: the tag that came with it; not compared when it is not given
        :returns: whether the block is right
        :raises Mismatch: it is not, and the scoreboard stops at the first
        :raises TypeError: the bits are not integers, booleans or text
        :raises ValueError: the bits are packed, or blocks are matched by tags and there is none

        >>> scoreboard = quarzel.Scoreboard(quarzel.Decoder())
        >>> expected = scoreboard.expect(np.full((3, 44), -8, dtype=np.int8))
        >>> scoreboard.check("0000x" + 35 * "0")
        Traceback (most recent call last):
            ...
        quarzel.Mismatch: block 0: bit 4 is x, the model gives 0; 1 of 40 bits differ
        """
        values = symbols(bits)
        number = None if tag is None else whole("tag", tag, 0, 0xFFFFFFFF)
        place = self._place(number)
        if place is None:
            which = f"tag {number}" if self.by_tag else f"block {self._sent}"
            return self._fail(f"{which}: came out, but no block has gone in for it", 0, values, number)
        expected = self._waiting[place]
        refuse_packed(values, len(expected.bits))
        del self._waiting[place]
        problem, wrong = difference(expected, values, number)
        if problem is not None:
            return self._fail(f"block {expected.number}: {problem}", wrong, values, number, expected)
        self.blocks += 1
        return True

    def finish(self) -> None:
        """The end of the test.

        :raises Mismatch: blocks differed, some have not come out, or none was checked

        >>> quarzel.Scoreboard(quarzel.Decoder()).finish()
        Traceback (most recent call last):
            ...
        quarzel.Mismatch: no block was checked; call expect for what goes in, and check for what comes out
        """
        if self.first_mismatch is not None:
            summary = f"{self.block_errors} of {self.blocks} blocks differ, in {self.bit_errors} bits"
            mismatch = Mismatch(f"{summary}; first {self.first_mismatch}")
            vars(mismatch).update(vars(self.first_mismatch))
            raise mismatch
        if self._waiting:
            first = self._waiting[0]
            text = f"{self.waiting} of {self._sent} blocks have not come out, the first is block {first.number}"
            raise self._mismatch(text, None, None, first)
        if not self.blocks:
            raise Mismatch("no block was checked; call expect for what goes in, and check for what comes out")

    def _place(self, tag: Optional[int]) -> Optional[int]:
        """The place of the waiting block that must come out now, or with a tag."""
        if not self.by_tag:
            return 0 if self._waiting else None
        if tag is None:
            raise ValueError("blocks are matched by their tags; give check the tag that came out")
        return next((place for place, block in enumerate(self._waiting) if block.tag == tag), None)

    def _fail(
        self,
        text: str,
        wrong_bits: int,
        bits: NDArray[Any],
        tag: Optional[int],
        expected: Optional[Expected] = None,
    ) -> bool:
        self.blocks += 1
        self.block_errors += 1
        self.bit_errors += wrong_bits
        mismatch = self._mismatch(text, bits, tag, expected)
        self.first_mismatch = self.first_mismatch or mismatch
        if self.stop_at_first:
            raise mismatch
        return False

    def _mismatch(
        self, text: str, bits: Optional[NDArray[Any]], tag: Optional[int], expected: Optional[Expected]
    ) -> Mismatch:
        mismatch = Mismatch(text)
        mismatch.bits = bits
        mismatch.tag = tag
        if expected is not None:
            mismatch.block = expected.number
            mismatch.expected = expected.bits
            mismatch.soft = expected.soft
            mismatch._model = self.decoder
            mismatch._iterations = expected.iterations
        return mismatch
