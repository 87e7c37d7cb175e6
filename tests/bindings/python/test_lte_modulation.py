# SPDX-License-Identifier: MIT
"""quarzel.lte: modulation and soft demodulation."""

import math

import numpy as np
import pytest
import standard_lte as standard

from quarzel import lte

SCHEMES = list(standard.BITS_OF_SYMBOL)


def words(scheme):
    """All words of a scheme, one a row."""
    Qm = standard.BITS_OF_SYMBOL[scheme]
    return (np.arange(2**Qm)[:, None] >> np.arange(Qm - 1, -1, -1) & 1).astype(np.uint8)


@pytest.mark.parametrize("scheme", SCHEMES)
def test_the_symbols_are_those_of_the_tables(scheme):
    symbols = lte.modulate(words(scheme), scheme)
    assert symbols.dtype == np.complex128
    assert np.allclose(symbols[:, 0], standard.symbols(scheme), rtol=0, atol=1e-15)
    assert math.isclose(np.mean(np.abs(symbols) ** 2), 1)


@pytest.mark.parametrize("scheme", SCHEMES)
def test_leading_axes_are_blocks(rng, scheme):
    Qm = standard.BITS_OF_SYMBOL[scheme]
    bits = rng.integers(0, 2, (2, 3, 5 * Qm))
    symbols = lte.modulate(bits, scheme)
    assert symbols.shape == (2, 3, 5)
    ratios = lte.demodulate(symbols, scheme, 0.5)
    assert ratios.shape == bits.shape and ratios.dtype == np.float64
    assert np.array_equal(ratios > 0, bits)


def expected_ratios(received, scheme, variances, method):
    """From the distances to all symbols."""
    exponents = -np.abs(received[..., None] - standard.symbols(scheme)) ** 2 / variances[..., None]
    join = np.logaddexp.reduce if method == "exact" else np.maximum.reduce
    ratios = [join(exponents[..., bit == 1], axis=-1) - join(exponents[..., bit == 0], axis=-1) for bit in words(scheme).T]
    return np.stack(ratios, axis=-1).reshape(*received.shape[:-1], -1)


@pytest.mark.parametrize("method", ["maxlog", "exact"])
@pytest.mark.parametrize("scheme", SCHEMES)
def test_the_ratios_are_those_of_all_symbols_or_the_nearest(rng, scheme, method):
    received = rng.normal(0, 1, (4, 50)) + 1j * rng.normal(0, 1, (4, 50))
    each = rng.uniform(0.05, 2, (4, 50))
    for variance in (0.3, np.float32(0.25), each, each[0], each[:, :1]):
        ratios = lte.demodulate(received, scheme, variance, method)
        right = expected_ratios(received, scheme, np.broadcast_to(variance, received.shape), method)
        assert np.allclose(ratios, right, rtol=1e-9, atol=1e-9)


@pytest.mark.parametrize(
    "call, error, text",
    [
        (lambda: lte.modulate([0, 1, 1], "16qam"), ValueError, "bits must be a multiple of 4, not 3; the nearest: 0, 4"),
        (lambda: lte.modulate([0, 2], "qpsk"), ValueError, "a bit must be 0 or 1"),
        (lambda: lte.modulate([0.0, 1.0], "qpsk"), TypeError, "integers or booleans, not float64"),
        (lambda: lte.modulate(0, "bpsk"), ValueError, "bits must be an array of bits"),
        (lambda: lte.modulate([0, 1], "8psk"), ValueError,
         "no modulation '8psk'; choose one of bpsk, qpsk, 16qam, 64qam, 256qam"),
        (lambda: lte.modulate([0, 1], 4), TypeError, "scheme must be a name, not int"),
        (lambda: lte.demodulate([1j], "qam", 1), ValueError, "choose one of bpsk, qpsk"),
        (lambda: lte.demodulate([1j], "qpsk", 0), ValueError, "noise_variance must be above 0 and finite"),
        (lambda: lte.demodulate([1j], "qpsk", math.nan), ValueError, "noise_variance must be above 0"),
        (lambda: lte.demodulate([1j], "qpsk", "1"), TypeError, "noise_variance must be real numbers"),
        (lambda: lte.demodulate([1j, 1j], "qpsk", [1, 1, 1]), ValueError,
         r"noise_variance of shape \(3,\) does not fit symbols of shape \(2,\); give one number, or one for each symbol"),
        (lambda: lte.demodulate([math.inf], "qpsk", 1), ValueError, "1 of 1 symbols are not finite"),
        (lambda: lte.demodulate(["a"], "qpsk", 1), TypeError, "symbols must be complex numbers"),
        (lambda: lte.demodulate(1j, "qpsk", 1), ValueError, "symbols must be an array"),
        (lambda: lte.demodulate([1j], "qpsk", 1, "log"), ValueError, "method of demodulation 'log'; choose one of exact, maxlog"),
        (lambda: lte.demodulate([1j], "qpsk", 1, None), TypeError, "method must be a name, not NoneType"),
    ],
)  # fmt: skip
def test_refuses_what_does_not_fit(call, error, text):
    with pytest.raises(error, match=text):
        call()
