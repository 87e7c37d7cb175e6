# SPDX-License-Identifier: MIT
"""A bit-accurate model of a hardware turbo decoder core for LTE (3GPP TS 36.212).

A first round trip::

    bits = numpy.random.default_rng(1).integers(0, 2, 1024, dtype=numpy.uint8)
    soft = numpy.where(quarzel.encode(bits), 8, -8).astype(numpy.int8)
    assert (quarzel.Decoder().decode(soft) == bits).all()

Soft values are integers in units of 1/8; positive means bit 1. A code block of K information bits comes as
three streams of K + 4 soft values (systematic, parity 1, parity 2), the last 4 positions holding the tail as
the standard places it.
"""

from ._core import ModelWarning
from ._core import version as __version__
from .code import Segments, block_sizes, encode, qpp, segments
from .decoder import Decoder, algorithms, implementations
from .scoreboard import Mismatch, Scoreboard
from .simulation import Curve, Point, SweepResult, sweep
from .trace import BlockTrace, read_trace

__all__ = [
    "BlockTrace",
    "Curve",
    "Decoder",
    "Mismatch",
    "ModelWarning",
    "Point",
    "Scoreboard",
    "Segments",
    "SweepResult",
    "__version__",
    "algorithms",
    "block_sizes",
    "encode",
    "implementations",
    "qpp",
    "read_trace",
    "segments",
    "sweep",
]
