# SPDX-License-Identifier: MIT
"""Links over Eb/N0: random bits, encoder, channel, quantiser, core, counting."""

from __future__ import annotations

import importlib
import json
import os
from dataclasses import dataclass, field
from typing import Any, Callable, Iterable, Literal, Optional, Union

import numpy as np
from numpy.typing import ArrayLike, NDArray

from . import _core
from ._checks import array_of, choice, real, whole
from ._decoder import algorithm_number, algorithms
from ._link import USUAL, link_configuration, listed, sending_text
from ._types import Algorithm, AlgorithmOrNumber, Units

_MAX_COUNT = 2**64 - 1
_MAX_THREADS = 1024


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


class SweepResult:
    """The result of a sweep, as in the files of the tool: ``quarzel sweep``, ``plot`` and ``verify-result``.

    >>> quarzel.sweep([0.4, 0.8], block_size=40, iterations=[2, 4], max_blocks=20)
    <SweepResult: 2 curves with 4 points>
    """

    def __init__(self, text: str) -> None:
        document = json.loads(text)
        self.text = text
        """the result file"""
        self.seed: int = document["seed"]
        """of bits and noise"""
        self.curves: list[Curve] = [_curve(curve) for curve in document["curves"]]
        """sorted by block size, units, algorithm, iterations and quantiser"""

    @classmethod
    def read(cls, path: Union[str, os.PathLike[str]]) -> SweepResult:
        """Read a result file, of an older version of the format too.

        :raises ValueError: it is not a whole, unaltered result

        >>> quarzel.sweep(1.0, block_size=40, max_blocks=20).save("result.json")
        >>> quarzel.SweepResult.read("result.json").curves[0].points[0].blocks
        20
        """
        with open(path, encoding="utf-8", newline="") as file:
            return cls(_extension().renew(file.read()))

    def save(self, path: Union[str, os.PathLike[str]]) -> None:
        """Write the result file; the tool writes the same bytes for the same configuration.

        >>> quarzel.sweep(1.0, block_size=40, max_blocks=20).save("result.json")
        """
        with open(path, "w", encoding="utf-8", newline="") as file:
            file.write(self.text)

    def to_dataframe(self) -> Any:
        """The points as a pandas DataFrame, a row each. Needs pandas.

        The columns are those of a curve, then those of a point, with the ends of the intervals in ``ber_low``,
        ``ber_high``, ``bler_low`` and ``bler_high``. Those of coded links are there when a curve has one. Lists are
        left out: what was counted after each iteration or transmission.

        :raises ImportError: pandas is not installed

        >>> quarzel.sweep([0.4, 0.8], block_size=40, max_blocks=20).to_dataframe()[["iterations", "ebn0_db", "blocks"]]
           iterations  ebn0_db  blocks
        0           6      0.4      20
        1           6      0.8      20
        """
        pandas = _optional("pandas", "to_dataframe needs pandas; install it, or read the points of SweepResult.curves")
        table = pandas.DataFrame([_row(curve, point) for curve in self.curves for point in curve.points])
        is_plain = all(getattr(curve, name) == usual for curve in self.curves for name, usual in USUAL.items())
        return table.drop(columns=list(USUAL)) if is_plain else table

    def plot(self, axes: Any = None, rate: Literal["ber", "bler"] = "bler") -> Any:
        """Draw a rate of the curves with 95 % intervals; a triangle is the upper bound where no error was seen.

        ``quarzel.plot`` draws whole figures. Needs Matplotlib.

        :param axes: Matplotlib axes to draw into; new ones when not given
        :param rate: ``"bler"`` or ``"ber"``
        :returns: the axes
        :raises ImportError: Matplotlib is not installed

        >>> axes = quarzel.sweep(1.0, block_size=40, max_blocks=20).plot(rate="ber")
        """
        from ._figure import draw, new_figure

        if rate not in ("ber", "bler"):
            raise ValueError(f"there is no rate {rate!r}; choose 'ber' or 'bler'")
        if axes is None:
            axes = new_figure().add_subplot()
        draw(axes, [(str(curve), curve) for curve in self.curves], rate)
        axes.legend(fontsize="small")
        return axes

    def __repr__(self) -> str:
        points = sum(len(curve.points) for curve in self.curves)
        return f"<SweepResult: {len(self.curves)} curves with {points} points>"


def sweep(
    ebn0_db: ArrayLike,
    *,
    block_size: Union[int, Iterable[int], None] = None,
    units: Union[Units, Iterable[Units]] = 2,
    algorithm: Union[AlgorithmOrNumber, Iterable[AlgorithmOrNumber]] = "scaled-max-log",
    iterations: Union[int, Iterable[int]] = 6,
    llr: Union[float, Iterable[float], None] = None,
    scale: Union[float, Iterable[float], None] = None,
    transport_block: Union[int, Iterable[int], None] = None,
    coded_bits: Union[int, Iterable[int], None] = None,
    code_rate: Union[float, Iterable[float], None] = None,
    modulation: Union[str, Iterable[str]] = "bpsk",
    channel: Union[str, Iterable[str]] = "awgn",
    demapping: Union[str, Iterable[str]] = "maxlog",
    rv: Union[int, Iterable[int], None] = None,
    harq: Optional[int] = None,
    stop: Literal["none", "crc"] = "none",
    seed: int = 1,
    max_blocks: int = 10000,
    max_block_errors: int = 100,
    max_seconds: int = 0,
    per_iteration: bool = False,
    threads: Optional[int] = None,
    on_point: Optional[Callable[[Curve, Point], None]] = None,
) -> SweepResult:
    """Simulate a link over Eb/N0. The same arguments give the same result, whatever the threads and the machine.

    :param ebn0_db: Eb/N0 of an information bit, one or many, in dB; the rate is taken as 1/3 unless blocks are coded
    :param block_size: K, one or many; 1024 when not given; likewise ``units``, ``algorithm`` and ``iterations``: every
        combination gives a curve
    :param llr: units for a log-likelihood ratio of 1, one or many; 4 when neither this nor ``scale`` is given
    :param scale: units for the amplitude 1 that is sent, one or many, instead of ``llr``
    :param transport_block: A, one or many: transport blocks with CRCs, cut into code blocks, instead of ``block_size``
    :param coded_bits: of a transmission, one or many; each code bit is sent once when neither this nor ``code_rate``
        is given
    :param code_rate: the same as information bits for each coded bit, taken to whole symbols
    :param modulation: ``"bpsk"``, ``"qpsk"``, ``"16qam"``, ``"64qam"`` or ``"256qam"``, one or many
    :param channel: ``"awgn"``, ``"rayleigh"`` (each symbol fades by itself) or ``"rayleigh-block"`` (each transmission
        does), one or many
    :param demapping: ``"maxlog"`` or ``"exact"`` log-likelihood ratios of symbols, one or many
    :param rv: redundancy version of each transmission, in turn; 0, with ``harq`` 0, 2, 3, 1 when not given
    :param harq: send a block up to so many times until it is right, soft values added up
    :param stop: ``"crc"``: the receiver ends the iterations of a transport block when its CRCs hold
    :param max_blocks: a point ends after so many blocks,
    :param max_block_errors: or with this block error (0: however many there are),
    :param max_seconds: or after this time (0: however long it takes); the result then depends on the clock
    :param per_iteration: count errors after every iteration
    :param threads: as many as the process may use when not given
    :param on_point: called with a curve (without points) and a point of it when that has ended, in order; what
        it raises ends the sweep
    :raises ValueError: the sweep is not possible; the text says why
    :raises ImportError: this build or this machine lacks what sweeps need; the text says what

    >>> (curve,) = quarzel.sweep([0.0, 6.0], block_size=40, max_blocks=50).curves
    >>> bool(curve.ber[1] < curve.ber[0])
    True
    >>> (curve,) = quarzel.sweep(6.0, block_size=40, code_rate=0.75, modulation="16qam", max_blocks=50).curves
    >>> curve.coded_bits
    52
    """
    if llr is not None and scale is not None:
        raise ValueError("llr and scale are two quantisers; give one of them")
    kind = "llr" if scale is None else "scale"
    units_of_one = scale if scale is not None else llr if llr is not None else _core.llr_scale
    count = len(os.sched_getaffinity(0)) if threads is None else whole("threads", threads, 1, _MAX_THREADS)
    configuration = {
        "seed": whole("seed", seed, 0, _MAX_COUNT),
        "max_blocks": whole("max_blocks", max_blocks, 0, _MAX_COUNT),
        "max_block_errors": whole("max_block_errors", max_block_errors, 0, _MAX_COUNT),
        "max_seconds": whole("max_seconds", max_seconds, 0, _MAX_COUNT),
        "per_iteration": bool(per_iteration),
        "quantiser": kind,
        "scale": [real(kind, value) for value in listed(units_of_one)],
        "units": [choice("units", value, (2, 4, 8)) for value in listed(units)],
        "algorithm": [algorithm_number(value) for value in listed(algorithm)],
        "iterations": [whole("iterations", value, 1, 15) for value in listed(iterations)],
        "ebn0_db": _decibels(ebn0_db),
        **link_configuration(
            block_size=block_size, transport_block=transport_block, coded_bits=coded_bits, code_rate=code_rate,
            modulation=modulation, channel=channel, demapping=demapping, rv=rv, harq=harq, stop=stop,
        ),  # fmt: skip
    }

    def tell(text: str) -> None:
        assert on_point is not None
        head = json.loads(text)
        (point,) = head["points"]
        on_point(_curve({**head, "points": []}), _point(point))

    return SweepResult(_extension().run(json.dumps(configuration), count, tell if on_point else None))


def _extension() -> Any:
    """The engine of sweeps, which is a part of its own: decoding does without."""
    try:
        return importlib.import_module("._sweep", __package__)
    except ModuleNotFoundError as error:
        raise ImportError(
            "this build of quarzel has no sweeps; build it with -DQUARZEL_SWEEP=ON where fmt, MPFR, nlohmann_json, "
            "OpenSSL and Random123 are installed"
        ) from error
    except ImportError as error:
        raise ImportError(f"sweeps need a library that is not installed: {error}") from error


def _optional(name: str, needs: str) -> Any:
    """A module that only a few functions need."""
    try:
        return importlib.import_module(name)
    except ImportError as error:
        raise ImportError(needs) from error


def _decibels(ebn0_db: ArrayLike) -> list[float]:
    array = array_of("ebn0_db", ebn0_db)
    if array.size and array.dtype.kind not in "fiu":
        raise TypeError(f"ebn0_db must hold real numbers in dB, not {array.dtype}")
    if array.size and not np.isfinite(array).all():
        raise ValueError("every Eb/N0 must be finite")
    return [round(float(value), 6) for value in array.reshape(-1)]


def _curve(values: dict[str, Any]) -> Curve:
    return Curve(
        **{
            **values,
            "algorithm": algorithms[values["algorithm"]],
            "points": [_point(point) for point in values["points"]],
            "redundancy_versions": tuple(values.get("redundancy_versions", (0,))),
        }
    )


def _point(values: dict[str, Any]) -> Point:
    intervals = {name: tuple(values[name]) for name in ("ber_interval", "bler_interval")}
    known = {name: value for name, value in values.items() if name in Point.__dataclass_fields__}
    return Point(**{**known, **intervals})


def _row(curve: Curve, point: Point) -> dict[str, Any]:
    """A point as a row of a table."""
    row = {name: value for name, value in vars(curve).items() if name != "points"}
    for name, value in vars(point).items():
        if name.endswith("_interval"):
            rate = name.removesuffix("_interval")
            row[f"{rate}_low"], row[f"{rate}_high"] = value
        elif name == "stopped_by" or not (value is None or isinstance(value, list)):
            row[name] = value
    return row
