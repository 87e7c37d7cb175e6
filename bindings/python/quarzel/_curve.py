# SPDX-License-Identifier: MIT
"""What a sweep counted."""

from __future__ import annotations

from dataclasses import dataclass, field
from typing import Any, Optional

import numpy as np
from numpy.typing import NDArray

from ._decoder import algorithms
from ._link import sending_text
from ._types import Algorithm, Units


@dataclass(frozen=True)
class Point:
    """What was counted at one Eb/N0."""

    ebn0_db: float
    blocks: int
    bits: int
    bit_errors: int
    block_errors: int
    bit_error_squares: int
    """sum over the blocks of their squared bit errors"""
    ber: float
    bler: float
    ber_interval: tuple[float, float]
    """holds the true rate with a probability of 95 %"""
    bler_interval: tuple[float, float]
    stopped_by: Optional[str]
    """``"block errors"``, ``"blocks"``, ``"time"``, or None where a sweep was interrupted"""
    per_iteration: Optional[list[dict[str, int]]] = None
    """``bit_errors`` and ``block_errors`` after each iteration"""
    throughput: Optional[float] = None
    """information bits of right blocks for each coded bit that was sent, over a coded link"""
    undetected_errors: Optional[int] = None
    """transport blocks with wrong bits whose CRCs hold"""
    mean_iterations: Optional[float] = None
    """of a receiver that stops; how often it used each number of them is in ``iterations_used``"""
    iterations_used: Optional[list[int]] = None
    transmissions: Optional[list[dict[str, Any]]] = None
    """what is left after each transmission, where there are several"""


@dataclass(frozen=True)
class Curve:
    """The points of one core and block size."""

    block_size: int
    units: Units
    algorithm: Algorithm
    iterations: int
    quantiser: str
    """``"llr"`` or ``"scale"``"""
    scale: float
    points: list[Point] = field(default_factory=list)
    transport_block: int = 0
    """A; 0: code blocks alone. ``block_size`` is then K of the last code block"""
    coded_bits: int = 0
    """of a transmission; 0: each code bit of code blocks alone once"""
    modulation: str = "bpsk"
    channel: str = "awgn"
    demapping: str = "maxlog"
    redundancy_versions: tuple[int, ...] = (0,)
    """of each transmission"""
    stop: str = "none"

    @property
    def information_bits(self) -> int:
        """K, or A of transport blocks."""
        return self.transport_block or self.block_size

    @property
    def ebn0_db(self) -> NDArray[np.float64]:
        """Eb/N0 of the points, in dB."""
        return np.array([point.ebn0_db for point in self.points])

    @property
    def ber(self) -> NDArray[np.float64]:
        """Bit error rates of the points."""
        return np.array([point.ber for point in self.points])

    @property
    def bler(self) -> NDArray[np.float64]:
        """Block error rates of the points."""
        return np.array([point.bler for point in self.points])

    def __str__(self) -> str:
        text = (
            f"{'A' if self.transport_block else 'K'} = {self.information_bits}, {self.units} units, {self.algorithm}, "
            f"{self.iterations} iterations, {self.quantiser} {self.scale:g}"
        )
        return ", ".join(part for part in (text, sending_text(self)) if part)


def curve_of(values: dict[str, Any]) -> Curve:
    """A curve of a result file."""
    return Curve(
        **{
            **values,
            "algorithm": algorithms[values["algorithm"]],
            "points": [point_of(point) for point in values["points"]],
            "redundancy_versions": tuple(values.get("redundancy_versions", (0,))),
        }
    )


def point_of(values: dict[str, Any]) -> Point:
    """A point of a result file."""
    intervals = {name: tuple(values[name]) for name in ("ber_interval", "bler_interval")}
    known = {name: value for name, value in values.items() if name in Point.__dataclass_fields__}
    return Point(**{**known, **intervals})
