# SPDX-License-Identifier: MIT
"""The decoder core."""

from __future__ import annotations

from types import TracebackType
from typing import Any, Callable, Literal, Optional, overload

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import array_of, choice, whole
from ._soft import soft_blocks
from ._trace import BlockTrace, trace_of_arrays
from ._types import Algorithm, AlgorithmOrNumber, Units

MAX_ITERATIONS = 15

algorithms: tuple[Algorithm, ...] = _core.algorithms
"""The arithmetics of the core, in the order of their numbers 0, 1 and 2."""


def implementations() -> tuple[str, ...]:
    """The implementations of the model that this machine can run, the fastest first.

    They are named by the instruction set in whose SIMD lanes they decode; the last one, ``"literal"``, decodes
    step by step. All give the same bits, tags and warnings.

    >>> quarzel.implementations()[-1]
    'literal'
    """
    return tuple(_core.implementations())


class Decoder:
    """A model of one configured core.

    :param units: processing units: 2, 4 or 8
    :param algorithm: ``"max-log"``, ``"scaled-max-log"`` (extrinsic values scaled by 0.75) or ``"max-star"``;
        their numbers 0, 1 and 2 may be given, too
    :param tag_width: width of the block tag in bits, 0 to 32; at 0 and at 32 every tag comes back as 0, as it
        does from the core
    :param implementation: one of :func:`implementations`; the fastest when it is not given

    Use it in a ``with`` statement, or call :meth:`close`, or leave it to the garbage collector. Only one thread
    at a time may use a decoder, a second one gets a RuntimeError. Threads that have a decoder each run side by
    side, since the GIL is released while blocks are decoded. The model warns of the first soft value that it
    saturates and of the first tag that it truncates: see :class:`ModelWarning`.

    The settings are fixed. A copy, and a decoder that was pickled, has the same settings and a fresh core, which
    has not decoded or warned before.

    >>> quarzel.Decoder(units=8, algorithm="max-star")
    Decoder(units=8, algorithm='max-star', tag_width=8)
    """

    def __init__(
        self,
        units: Units = 2,
        algorithm: AlgorithmOrNumber = "scaled-max-log",
        tag_width: int = 8,
        implementation: Optional[str] = None,
    ) -> None:
        self._units: Units = choice("units", units, (2, 4, 8))
        self._algorithm = algorithm_number(algorithm)
        self._tag_width = whole("tag_width", tag_width, 0, 32)
        if implementation is not None and implementation not in implementations():
            names = ", ".join(implementations())
            raise ValueError(
                f"there is no implementation {implementation!r}; leave it out for the fastest one, or choose one of {names}"
            )
        self._wanted = implementation
        self._core = _core.open_core(self._units, self._algorithm, self._tag_width, implementation or "")

    def __setattr__(self, name: str, value: object) -> None:
        if not name.startswith("_") and (type(self) is Decoder or hasattr(Decoder, name)):
            raise AttributeError(
                f"{name} cannot be set: a decoder keeps its settings; make another one with Decoder(units, algorithm, "
                "tag_width, implementation)"
            )
        super().__setattr__(name, value)

    def __reduce__(self) -> tuple[Callable[..., Decoder], tuple[Any, ...]]:
        return type(self), (self.units, self.algorithm, self.tag_width, self._wanted)

    @property
    def units(self) -> Units:
        """Processing units."""
        return self._units

    @property
    def algorithm(self) -> Algorithm:
        """The name of the arithmetic."""
        return algorithms[self._algorithm]

    @property
    def tag_width(self) -> int:
        """Width of the block tag in bits."""
        return self._tag_width

    @property
    def implementation(self) -> str:
        """The name of the implementation that decodes. Traced blocks are always decoded by ``"literal"``."""
        return _core.implementation(self._core)

    @overload
    def decode(
        self,
        systematic: ArrayLike,
        parity1: Optional[ArrayLike] = None,
        parity2: Optional[ArrayLike] = None,
        iterations: int = 6,
        *,
        tags: None = None,
        packed: bool = False,
    ) -> NDArray[np.uint8]: ...

    @overload
    def decode(
        self,
        systematic: ArrayLike,
        parity1: Optional[ArrayLike] = None,
        parity2: Optional[ArrayLike] = None,
        iterations: int = 6,
        *,
        tags: ArrayLike,
        packed: bool = False,
    ) -> tuple[NDArray[np.uint8], NDArray[np.uint32]]: ...

    def decode(
        self,
        systematic: ArrayLike,
        parity1: Optional[ArrayLike] = None,
        parity2: Optional[ArrayLike] = None,
        iterations: int = 6,
        *,
        tags: Optional[ArrayLike] = None,
        packed: bool = False,
    ) -> Any:
        """Decode one block, or many of one size, which is faster than a call for each.

        :param systematic: (..., K + 4) soft values of int8, int16 or int32 in units of 1/8, positive for bit
            1; or all three streams in one array (..., 3, K + 4), without parities
        :param parity1: (..., K + 4), parity of the first constituent code
        :param parity2: (..., K + 4), parity of the second constituent code
        :param iterations: 1 to 15; every one of them runs
        :param tags: one tag a block, in the shape of the blocks
        :param packed: pack 8 bits to a byte, first bit highest, as numpy.packbits does
        :returns: (..., K) uint8 of 0 and 1, or (..., K / 8) when packed; with tags a tuple of them and the
            tags that come back, masked to the tag width
        :raises TypeError: a stream is not int8, int16 or int32
        :raises ValueError: shapes differ, there is no block size K, or the decoder is closed
        :raises RuntimeError: another thread is using the decoder

        >>> bits = np.random.default_rng(1).integers(0, 2, (10, 40), dtype=np.uint8)
        >>> soft = np.where(quarzel.encode(bits), 8, -8).astype(np.int8)
        >>> bool((quarzel.Decoder().decode(soft) == bits).all())
        True
        """
        if tags is None and not packed:
            # One block costs so little that the checks below would take half of the time.
            plain = _core.decode_plain(self._core, systematic, parity1, parity2, iterations)
            if plain is not None:
                return plain
        blocks = soft_blocks(systematic, parity1, parity2)
        tag_array = None if tags is None else _tag_array(tags, blocks.shape)
        count = whole("iterations", iterations, 1, MAX_ITERATIONS)
        bits, tags_back = _core.decode(self._core, *blocks.streams, count, tag_array, False)
        if packed:
            bits = np.packbits(bits, axis=-1)
        bits = bits.reshape(*blocks.shape, bits.shape[-1])
        return bits if tags is None else (bits, tags_back.reshape(blocks.shape))

    def decode_every_iteration(
        self,
        systematic: ArrayLike,
        parity1: Optional[ArrayLike] = None,
        parity2: Optional[ArrayLike] = None,
        iterations: int = 6,
    ) -> NDArray[np.uint8]:
        """Decode as :meth:`decode` does, and give the decisions after every iteration.

        :returns: (..., iterations, K) uint8 of 0 and 1; index i - 1 holds what ``decode(..., iterations=i)`` gives

        >>> quarzel.Decoder().decode_every_iteration(np.full((3, 44), -8, dtype=np.int8), iterations=4).shape
        (4, 40)
        """
        blocks = soft_blocks(systematic, parity1, parity2)
        count = whole("iterations", iterations, 1, MAX_ITERATIONS)
        bits, _ = _core.decode(self._core, *blocks.streams, count, None, True)
        return bits.reshape(*blocks.shape, *bits.shape[1:])

    def trace(
        self,
        systematic: ArrayLike,
        parity1: Optional[ArrayLike] = None,
        parity2: Optional[ArrayLike] = None,
        iterations: int = 6,
        *,
        passes: Optional[int] = None,
    ) -> BlockTrace:
        """Decode one block and keep every value of its first passes. Much slower than :meth:`decode`.

        :param passes: how many, two an iteration; all of them when it is not given
        :returns: the trace, with the bits

        >>> quarzel.Decoder().trace(np.full((3, 44), -8, dtype=np.int8), iterations=2)
        <BlockTrace: block 0, K = 40, 4 passes>
        """
        blocks = soft_blocks(systematic, parity1, parity2)
        if blocks.shape != ():
            raise ValueError(f"a trace shows one block, not blocks of shape {blocks.shape}; pick one of them")
        all_passes = 2 * whole("iterations", iterations, 1, MAX_ITERATIONS)
        count = all_passes if passes is None else min(whole("passes", passes, 1), all_passes)
        bits, block, inputs, signals = _core.trace(self._core, *blocks.streams, all_passes // 2, count)
        return trace_of_arrays(block, inputs, signals, bits[0])

    def close(self) -> None:
        """Free the model. It may be called again.

        >>> decoder = quarzel.Decoder()
        >>> decoder.close()
        >>> decoder.decode(np.full((3, 44), -8, dtype=np.int8))
        Traceback (most recent call last):
            ...
        ValueError: the decoder has been closed; make a new one
        """
        _core.close_core(self._core)

    def __enter__(self) -> Decoder:
        return self

    def __exit__(
        self,
        kind: Optional[type[BaseException]],
        error: Optional[BaseException],
        traceback: Optional[TracebackType],
    ) -> Literal[False]:
        self.close()
        return False

    def __repr__(self) -> str:
        return f"Decoder(units={self.units}, algorithm={self.algorithm!r}, tag_width={self.tag_width})"


def algorithm_number(algorithm: AlgorithmOrNumber) -> int:
    """The number of an algorithm that is given by name or number.

    :raises TypeError: it is neither
    :raises ValueError: there is no such algorithm
    """
    if not isinstance(algorithm, str):
        return choice("algorithm", algorithm, (0, 1, 2))
    if algorithm not in algorithms:
        raise ValueError(f"there is no algorithm {algorithm!r}; choose one of {', '.join(algorithms)}")
    return algorithms.index(algorithm)


def _tag_array(tags: ArrayLike, shape: tuple[int, ...]) -> NDArray[np.uint32]:
    array = array_of("tags", tags)
    if array.size and array.dtype.kind not in "iu":
        raise TypeError(f"tags must be whole numbers from 0 to 4294967295, not {array.dtype}")
    if array.shape != shape:
        raise ValueError(f"tags have the shape {array.shape}, the blocks {shape}; give one tag a block")
    if array.size and (array.min() < 0 or array.max() > 0xFFFFFFFF):
        raise ValueError("tags must be from 0 to 4294967295")
    return np.ascontiguousarray(array.reshape(-1), dtype=np.uint32)
