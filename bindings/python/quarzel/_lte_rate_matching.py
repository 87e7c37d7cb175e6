# SPDX-License-Identifier: MIT
"""Rate matching of LTE and its inverse on soft values (3GPP TS 36.212, 5.1.4.1)."""

from __future__ import annotations

from typing import Any, Optional

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import array_of, bit_array, choice, rows_of, whole
from ._code import block_size
from ._lte_coding import MAX_COUNT
from ._types import RedundancyVersion


def whole_buffer_size(K: int) -> int:
    """K_w, the entries of the whole circular buffer of a code block, dummies included.

    >>> quarzel.lte.whole_buffer_size(6144)
    18528
    """
    return _core.whole_buffer_size(block_size(K))


def rate_match(
    streams: ArrayLike, E: int, rv: RedundancyVersion = 0, buffer_size: Optional[int] = None, filler: int = 0
) -> NDArray[np.uint8]:
    """Select the bits of code blocks that are sent.

    :param streams: (..., 3, K + 4) code bits as :func:`turbo_encode` gives them
    :param E: how many are sent
    :param rv: redundancy version, 0 to 3
    :param buffer_size: N_cb, the entries of the circular buffer that are used; all of them without
    :param filler: F, filler bits in front of the block; they are never sent
    :returns: (..., E) bits

    >>> quarzel.lte.rate_match(quarzel.encode(np.ones((7, 40), np.uint8)), E=100, rv=2).shape
    (7, 100)
    """
    array = bit_array("streams", streams, "3 x (K + 4) bits")
    if array.ndim < 2 or array.shape[-2] != 3:
        raise ValueError(f"streams must have the shape (..., 3, K + 4), not {array.shape}")
    coded = _core.rate_match(rows_of(array, 2), *_matching(E, rv, buffer_size, filler))
    return coded.reshape(*array.shape[:-2], coded.shape[-1])


def rate_recover(
    soft: ArrayLike,
    K: int,
    rv: RedundancyVersion = 0,
    buffer_size: Optional[int] = None,
    filler: int = 0,
    buffer: Optional[NDArray[np.int16]] = None,
    width: int = 8,
) -> NDArray[np.int8]:
    """Undo rate matching on soft values, which are added where bits were sent several times.

    :param soft: (..., E) soft values of int8 or int16, positive for bit 1
    :param K: the block size
    :param buffer: (..., N_cb) int16, the circular buffer of earlier transmissions in the order of the standard's w, or
        zeros: the soft values are added to it, in place. N_cb is ``buffer_size``, or :func:`whole_buffer_size`
    :param width: bits of a sum, 2 to 16: sums are clipped to -2^(width-1) ... 2^(width-1) - 1
    :param rv, buffer_size, filler: as for :func:`rate_match`
    :returns: (..., 3, K + 4) int8 as :meth:`quarzel.Decoder.decode` takes them: the sums, clipped to 8 bits; -128 for
        filler bits, 0 for what was not received

    >>> buffer = np.zeros(quarzel.lte.whole_buffer_size(40), np.int16)
    >>> code = quarzel.encode(np.ones(40, np.uint8))
    >>> for rv in (0, 2):
    ...     soft = np.where(quarzel.lte.rate_match(code, E=80, rv=rv), 9, -9).astype(np.int8)
    ...     streams = quarzel.lte.rate_recover(soft, K=40, rv=rv, buffer=buffer)
    >>> int(np.count_nonzero(streams)), int(streams.max())
    (132, 18)
    """
    K = block_size(K)
    array = soft_array("soft", soft, "E soft values")
    shape = array.shape[:-1]
    _, rv, buffer_size, filler = _matching(array.shape[-1], rv, buffer_size, filler)
    width = whole("width", width, 2, 16)
    sums = None if buffer is None else buffer_rows("buffer", buffer, shape)
    streams = _core.rate_recover(rows_of(array), K, rv, buffer_size, filler, sums, width)
    if buffer is not None and sums is not None:
        buffer[...] = sums.reshape(buffer.shape)
    return streams.reshape(*shape, *streams.shape[1:])


def soft_array(name: str, values: ArrayLike, what: str) -> NDArray[np.int16]:
    """Soft values as they are added.

    :raises TypeError: they are not int8 or int16
    :raises ValueError: they are a single number
    """
    array = array_of(name, values)
    if array.dtype.kind != "i" or array.dtype.itemsize > 2:
        remedy = f"quarzel.quantise({name})" if array.dtype.kind == "f" else f"{name}.astype(numpy.int16)"
        raise TypeError(f"{name} must be int8 or int16, not {array.dtype}; use {remedy}")
    if array.ndim == 0:
        raise ValueError(f"{name} must be an array of {what}, or of blocks of {what}")
    return array.astype(np.int16, copy=False)


def buffer_rows(name: str, buffer: Any, shape: tuple[int, ...]) -> NDArray[np.int16]:
    """A copy of soft buffers, a row for each block.

    :param shape: of the blocks
    :raises TypeError: they are not an array of int16
    :raises ValueError: they are of another shape
    """
    if not isinstance(buffer, np.ndarray) or (buffer.dtype.kind, buffer.dtype.itemsize) != ("i", 2):
        kind = buffer.dtype if isinstance(buffer, np.ndarray) else type(buffer).__name__
        raise TypeError(f"{name} must be an array of int16, not {kind}")
    if buffer.ndim != len(shape) + 1 or buffer.shape[:-1] != shape:
        raise ValueError(f"{name} of shape {buffer.shape} does not belong to blocks of shape {shape}; give one a block")
    return rows_of(np.array(buffer, dtype=np.int16))


def _matching(
    E: int, rv: RedundancyVersion, buffer_size: Optional[int], filler: int
) -> tuple[int, RedundancyVersion, Optional[int], int]:
    size = None if buffer_size is None else whole("buffer_size", buffer_size, 1, MAX_COUNT)
    return whole("E", E, 1, MAX_COUNT), choice("rv", rv, (0, 1, 2, 3)), size, whole("filler", filler, 0, MAX_COUNT)
