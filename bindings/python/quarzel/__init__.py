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

from . import lte
from ._code import Segments, block_sizes, encode, qpp, segments
from ._core import ModelWarning
from ._core import version as __version__
from ._curve import Curve, Point
from ._decoder import Decoder, algorithms, implementations
from ._figure import plot
from ._mismatch import Mismatch
from ._result import SweepResult
from ._scoreboard import Scoreboard
from ._simulation import sweep
from ._soft import quantise
from ._trace import BlockTrace, read_trace
from ._types import Algorithm, Units

__all__ = [
    "Algorithm",
    "BlockTrace",
    "Curve",
    "Decoder",
    "Mismatch",
    "ModelWarning",
    "Point",
    "Scoreboard",
    "Segments",
    "SweepResult",
    "Units",
    "__version__",
    "algorithms",
    "block_sizes",
    "encode",
    "implementations",
    "lte",
    "plot",
    "qpp",
    "quantise",
    "read_trace",
    "segments",
    "sweep",
]

# Tracebacks, pickles and help name the package, not the submodule where something happens to stand.
for _public in (BlockTrace, Curve, Decoder, Mismatch, Point, Scoreboard, Segments, SweepResult, encode, implementations,
                plot, qpp, quantise, read_trace, segments, sweep):  # fmt: skip
    _public.__module__ = __name__
del _public
