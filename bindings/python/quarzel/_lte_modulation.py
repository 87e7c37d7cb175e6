# SPDX-License-Identifier: MIT
"""Modulation of LTE (3GPP TS 36.211, 7.1), and its inverse on soft values."""

from __future__ import annotations

import math
from typing import Any

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import array_of, bit_array, rows_of
from ._types import DemodulationMethod, Scheme


def modulate(bits: ArrayLike, scheme: Scheme) -> NDArray[np.complex128]:
    """Turn bits into symbols of mean energy 1.

    :param bits: (..., n) bits, a multiple of the bits of a symbol
    :param scheme: ``"bpsk"``, ``"qpsk"``, ``"16qam"``, ``"64qam"`` or ``"256qam"``
    :returns: (..., n / Q_m) symbols

    >>> np.round(quarzel.lte.modulate([0, 0, 1, 0], "qpsk"), 4)
    array([ 0.7071+0.7071j, -0.7071+0.7071j])
    """
    array = bit_array("bits", bits, "bits")
    symbols = _core.modulate(rows_of(array), scheme_name(scheme))
    return symbols.reshape(*array.shape[:-1], symbols.shape[-1])


def demodulate(
    symbols: ArrayLike, scheme: Scheme, noise_variance: ArrayLike, method: DemodulationMethod = "maxlog"
) -> NDArray[np.float64]:
    """The log-likelihood ratios ln P(1) / P(0) of the bits of received symbols. :func:`quarzel.quantise` makes soft
    values of them.

    :param symbols: (..., n) complex numbers; divide by the channel's gain h before
    :param scheme: as for :func:`modulate`
    :param noise_variance: of a symbol, real and imaginary part together: one number, or one for each symbol in any
        shape that can be broadcast to theirs (after division by h: the noise's, divided by abs(h) ** 2)
    :param method: ``"maxlog"``, from the nearest symbol for each value of a bit, or ``"exact"``, from all
    :returns: (..., n Q_m) ratios

    >>> symbols = quarzel.lte.modulate([0, 1, 1, 0], "16qam")
    >>> np.round(quarzel.lte.demodulate(symbols, "16qam", noise_variance=0.1), 3)
    array([-16.,   4.,   4.,  -4.])
    """
    array = array_of("symbols", symbols)
    if array.dtype.kind not in "cfiu":
        raise TypeError(f"symbols must be complex numbers, not {array.dtype}")
    if array.ndim == 0:
        raise ValueError("symbols must be an array of symbols, or of blocks of symbols")
    wrong = np.count_nonzero(~np.isfinite(array))
    if wrong:
        raise ValueError(f"{wrong} of {array.size} symbols are not finite; 0 with a large noise variance is an erasure")
    variances = _variances(noise_variance, array.shape)
    rows = rows_of(array.astype(np.complex128, copy=False))
    ratios = _core.demodulate(rows, scheme_name(scheme), variances, _text("method", method))
    return ratios.reshape(*array.shape[:-1], ratios.shape[-1])


def scheme_name(scheme: Scheme) -> str:
    """The name of a scheme, which the extension looks up.

    :raises TypeError: it is not a text
    """
    return _text("scheme", scheme)


def _variances(noise_variance: ArrayLike, shape: tuple[int, ...]) -> NDArray[np.float64]:
    """One variance, or one for each symbol, in a row."""
    array = array_of("noise_variance", noise_variance)
    if array.dtype.kind not in "fiu":
        raise TypeError(f"noise_variance must be real numbers, not {array.dtype}")
    values = array.astype(np.float64, copy=False)
    if not ((values > 0) & (values < math.inf)).all():
        raise ValueError("noise_variance must be above 0 and finite")
    if values.ndim > 0:
        try:
            values = np.broadcast_to(values, shape)
        except ValueError:
            raise ValueError(
                f"noise_variance of shape {array.shape} does not fit symbols of shape {shape}; give one number, or one for "
                "each symbol"
            ) from None
    return np.ascontiguousarray(values).reshape(-1)


def _text(name: str, value: Any) -> str:
    if not isinstance(value, str):
        raise TypeError(f"{name} must be a name, not {type(value).__name__}")
    return value
