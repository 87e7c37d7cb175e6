# SPDX-License-Identifier: MIT
"""Transport blocks of LTE through the whole coding chain (3GPP TS 36.212, 5.1.1 to 5.1.5), and back."""

from __future__ import annotations

from typing import Optional

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import bit_array, choice, rows_of, whole
from ._decoder import MAX_ITERATIONS, algorithm_number
from ._lte_coding import MAX_COUNT
from ._lte_modulation import scheme_name
from ._lte_rate_matching import buffer_rows, soft_array
from ._types import AlgorithmOrNumber, RedundancyVersion, Scheme, Units

_MAX_LAYERS = 4


def encode_transport_block(
    bits: ArrayLike, G: int, scheme: Scheme = "qpsk", layers: int = 1, rv: RedundancyVersion = 0
) -> NDArray[np.uint8]:
    """Encode transport blocks: CRC, segmentation, turbo code, rate matching with whole circular buffers, concatenation.

    :param bits: (..., A) bits
    :param G: coded bits of a transport block, a multiple of ``layers`` times the bits of a symbol
    :param scheme: ``"bpsk"``, ``"qpsk"``, ``"16qam"``, ``"64qam"`` or ``"256qam"``
    :param layers: N_L, 1 to 4; 2 for transmit diversity
    :param rv: redundancy version, 0 to 3
    :returns: (..., G) bits

    >>> quarzel.lte.encode_transport_block(np.ones((10, 7224), np.uint8), G=21912, scheme="16qam").shape
    (10, 21912)
    """
    array = bit_array("bits", bits, "A bits")
    coded = _core.encode_transport_block(
        rows_of(array), whole("G", G, 1, MAX_COUNT), *_transmission(scheme, layers, rv)
    )
    return coded.reshape(*array.shape[:-1], coded.shape[-1])


def decode_transport_block(
    soft: ArrayLike,
    A: int,
    scheme: Scheme = "qpsk",
    layers: int = 1,
    rv: RedundancyVersion = 0,
    iterations: int = 8,
    units: Units = 8,
    algorithm: AlgorithmOrNumber = "scaled-max-log",
    buffers: Optional[NDArray[np.int16]] = None,
) -> tuple[NDArray[np.uint8], NDArray[np.bool_], NDArray[np.int16]]:
    """Decode transport blocks: rate recovery with soft combining in 8 bits, the core, the CRCs.

    :param soft: (..., G) soft values of int8 or int16, positive for bit 1
    :param A: bits of a transport block, without its CRC
    :param iterations, units, algorithm: of the core, as for :class:`quarzel.Decoder`
    :param buffers: what an earlier call returned for the same transport blocks: this transmission is added to it. It is
        not changed
    :param scheme, layers, rv: as for :func:`encode_transport_block`
    :returns: (..., A) bits; (...) whether the CRC of the transport block holds; and (..., n) int16, the soft buffers for
        the next transmission

    >>> bits = np.random.default_rng(1).integers(0, 2, (4, 1000), dtype=np.uint8)
    >>> buffers = None
    >>> for rv in (0, 2):
    ...     coded = quarzel.lte.encode_transport_block(bits, G=1200, rv=rv)
    ...     soft = np.where(coded, 4, -4).astype(np.int8)
    ...     decided, ok, buffers = quarzel.lte.decode_transport_block(soft, A=1000, rv=rv, buffers=buffers)
    >>> bool((decided == bits).all()), ok
    (True, array([ True,  True,  True,  True]))
    """
    array = soft_array("soft", soft, "G soft values")
    shape = array.shape[:-1]
    A = whole("A", A, 1, MAX_COUNT)
    whole("the number of soft values of a transport block", array.shape[-1], 1)
    size = _core.soft_values(A)
    if buffers is None:
        buffers = np.zeros((*shape, size), np.int16)
    sums = buffer_rows("buffers", buffers, shape)
    if sums.shape[-1] != size:
        raise ValueError(f"transport blocks of A = {A} bits have soft buffers of {size} values, not {sums.shape[-1]}")
    settings = (choice("units", units, (2, 4, 8)), algorithm_number(algorithm))
    iterations = whole("iterations", iterations, 1, MAX_ITERATIONS)
    core = _core.open_core(*settings, 0, "")
    bits, ok = _core.decode_transport_block(
        core, rows_of(array), A, *_transmission(scheme, layers, rv), iterations, sums
    )
    return bits.reshape(*shape, A), ok.astype(bool).reshape(shape), sums.reshape(*shape, size)


def _transmission(scheme: Scheme, layers: int, rv: RedundancyVersion) -> tuple[str, int, RedundancyVersion]:
    return scheme_name(scheme), whole("layers", layers, 1, _MAX_LAYERS), choice("rv", rv, (0, 1, 2, 3))
