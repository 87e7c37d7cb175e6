# SPDX-License-Identifier: MIT
"""The coding chain of LTE round the code (3GPP TS 36.212 and 36.211), arrays in and out.

Each function is for one clause of the standard, and those of the receiver are their inverses on soft values. The last
axis of an array holds a block, leading axes hold many. Bits are uint8 of 0 and 1; positive soft values mean bit 1.
"""

from ._lte_coding import (
    NULL,
    CodeBlocks,
    crc8,
    crc16,
    crc24a,
    crc24b,
    desegment,
    segment,
    turbo_encode,
)
from ._lte_modulation import demodulate, modulate
from ._lte_rate_matching import rate_match, rate_recover, whole_buffer_size
from ._lte_transport import decode_transport_block, encode_transport_block
from ._types import DemodulationMethod, RedundancyVersion, Scheme

__all__ = [
    "NULL",
    "CodeBlocks",
    "DemodulationMethod",
    "RedundancyVersion",
    "Scheme",
    "crc16",
    "crc24a",
    "crc24b",
    "crc8",
    "decode_transport_block",
    "demodulate",
    "desegment",
    "encode_transport_block",
    "modulate",
    "rate_match",
    "rate_recover",
    "segment",
    "turbo_encode",
    "whole_buffer_size",
]

for _public in (CodeBlocks, crc16, crc24a, crc24b, crc8, decode_transport_block, demodulate, desegment,
                encode_transport_block, modulate, rate_match, rate_recover, segment, turbo_encode,
                whole_buffer_size):  # fmt: skip
    _public.__module__ = __name__
del _public
