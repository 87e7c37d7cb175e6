# SPDX-License-Identifier: MIT
"""Checks of arguments whose errors say what to do."""

from __future__ import annotations

import math
import operator
from typing import Any, Optional, TypeVar

import numpy as np
from numpy.typing import ArrayLike, NDArray

Number = TypeVar("Number", bound=int)


def whole(name: str, value: Any, least: int, most: Optional[int] = None) -> int:
    """A whole number in a range, of any integer type.

    :raises TypeError: it is not a whole number
    :raises ValueError: it is not in the range
    """
    try:
        number = operator.index(value)
    except TypeError:
        raise TypeError(f"{name} must be a whole number, not {_kind(value)}") from None
    if number < least or (most is not None and number > most):
        numbers = f"{least} or more" if most is None else f"a number from {least} to {most}"
        raise ValueError(f"{name} must be {numbers}, not {number}")
    return number


def choice(name: str, value: Any, choices: tuple[Number, ...]) -> Number:
    """One of a few whole numbers.

    :raises TypeError: it is not a whole number
    :raises ValueError: it is not one of them
    """
    *first, last = choices
    text = f"{', '.join(map(str, first))} or {last}"
    try:
        number = operator.index(value)
    except TypeError:
        raise TypeError(f"{name} must be {text}, not {_kind(value)}") from None
    for candidate in choices:
        if candidate == number:
            return candidate
    raise ValueError(f"{name} must be {text}, not {number}")


def real(name: str, value: Any) -> float:
    """A number above 0.

    :raises TypeError: it is not a number
    :raises ValueError: it is not above 0, or not finite
    """
    if isinstance(value, (str, bytes)):
        raise TypeError(f"{name} must be a number, not {type(value).__name__}")
    try:
        number = float(value)
    except (TypeError, ValueError):
        raise TypeError(f"{name} must be a number, not {type(value).__name__}") from None
    if not 0 < number < math.inf:
        raise ValueError(f"{name} must be above 0 and finite, not {value}")
    return number


def array_of(name: str, values: ArrayLike) -> NDArray[Any]:
    """Values as an array, which is the caller's own where they are one.

    :raises TypeError: they are masked
    :raises ValueError: they are nested unevenly
    """
    if isinstance(values, np.ma.MaskedArray):
        raise TypeError(f"{name} is a masked array, and the core knows no mask; use {name}.filled(0)")
    try:
        return np.asarray(values)
    except ValueError:
        raise ValueError(f"{name} is not an array: its rows must have the same length") from None


def bit_array(name: str, values: ArrayLike, what: str) -> NDArray[np.uint8]:
    """Bits in bytes. What is neither 0 nor 1 stays something else.

    :param what: a block holds, for the error text
    :raises TypeError: they are not integers or booleans, or are masked
    :raises ValueError: they are a single number, or nested unevenly
    """
    array = array_of(name, values)
    if array.dtype.kind not in "biu":
        raise TypeError(f"{name} must be integers or booleans, not {array.dtype}; use {name}.astype(numpy.uint8)")
    if array.ndim == 0:
        raise ValueError(f"{name} must be an array of {what}, or of blocks of {what}")
    if array.dtype != np.uint8:
        # What does not fit a byte must not become a bit by losing its upper part.
        array = np.where((array == 0) | (array == 1), array, 2).astype(np.uint8)
    return array


def rows_of(array: NDArray[Any], block_dimensions: int = 1) -> NDArray[Any]:
    """The blocks of an array, whose last dimensions are those of a block, along one leading axis and in memory after
    one another."""
    split = array.ndim - block_dimensions
    return np.ascontiguousarray(array.reshape(math.prod(array.shape[:split]), *array.shape[split:]))


def _kind(value: Any) -> str:
    return repr(value) if isinstance(value, str) else type(value).__name__
