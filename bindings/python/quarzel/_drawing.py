# SPDX-License-Identifier: MIT
"""Error rates in Matplotlib's axes."""

from __future__ import annotations

import math
from typing import Any, Optional

import numpy as np

from ._curve import Curve, Point
from ._link import bits_per_symbol
from ._optional import optional_module
from ._reference import Reference

_COLOURS = ("#0072b2", "#d55e00", "#009e73", "#cc79a7", "#000000", "#e69f00", "#56b4e9")
"""People with any kind of colour vision tell them apart (M. Okabe and K. Ito, 2008)."""
_LINE = np.array([(13, 8, 135), (100, 0, 167), (166, 32, 152), (213, 84, 110), (245, 136, 70), (245, 185, 40)]) / 255
"""Corners of a line of colours, which grow lighter: for more curves."""
_MARKS = ("o", "s", "^", "D", "p")
_REFERENCE_STYLES = (("#404040", "--", "s"), ("#808080", ":", "^"), ("#606060", "-.", "D"), ("#404040", "--", "p"))
_DEVIATIONS = 1.959963984540054
_NAMES = {"ber": "Bit error rate", "bler": "Block error rate"}


def new_figure(size: Optional[tuple[float, float]] = None) -> Any:
    """An empty figure."""
    pyplot = optional_module("matplotlib.pyplot", "plot needs Matplotlib; install it, or use 'quarzel plot'")
    return pyplot.figure(figsize=size, layout="constrained")


def draw(axes: Any, curves: list[tuple[str, Curve]], rate: str) -> None:
    """Draw a rate of labelled curves into axes."""
    frame(axes, rate, draw_measured(axes, curves, rate, False))


def draw_measured(axes: Any, curves: list[tuple[str, Curve]], rate: str, over_esn0: bool) -> float:
    """Points with their intervals, and bounds where no error was seen. Returns the lowest mark."""
    lowest = 1.0
    for index, (label, curve) in enumerate(curves):
        colour = _colour(index, len(curves))
        shift = _shift(curve) if over_esn0 else 0
        seen = [point for point in curve.points if point.block_errors > 0]
        rates = np.array([getattr(point, rate) for point in seen])
        intervals = np.array([_interval(point, rate) for point in seen]).reshape(-1, 2)
        axes.errorbar(
            [point.ebn0_db + shift for point in seen], rates, np.abs(intervals - rates[:, None]).T,
            color=colour, marker=_MARKS[index % len(_MARKS)], linewidth=1, elinewidth=0.6, capsize=2, label=label,
        )  # fmt: skip
        silent = [point for point in curve.points if point.block_errors == 0]
        bounds = [_bound(curve, point, rate) for point in silent]
        axes.plot([point.ebn0_db + shift for point in silent], bounds, "v", color=colour, fillstyle="none")
        lowest = min([lowest, *rates, *bounds])
    if any(point.block_errors == 0 for _, curve in curves for point in curve.points):
        axes.plot([], [], "v", color="black", fillstyle="none", label="no error: 95 % upper bound")
    return lowest


def draw_iterations(
    axes: Any, curve: Curve, lines: list[int], labels: Optional[list[str]], rate: str, over_esn0: bool
) -> float:
    """A line for each iteration. Returns the lowest mark."""
    lowest = 1.0
    shift = _shift(curve) if over_esn0 else 0
    trials = curve.information_bits if rate == "ber" else 1
    for index, count in enumerate(lines):
        errors = [(point, (point.per_iteration or [])[count - 1]) for point in curve.points]
        name = "bit_errors" if rate == "ber" else "block_errors"
        marks = [(p.ebn0_db + shift, e[name] / p.blocks / trials) for p, e in errors if e[name] > 0]
        label = labels[index] if labels else f"after {count} iteration{'s' * (count > 1)}"
        colour, mark = _colour(index, len(lines)), _MARKS[index % len(_MARKS)]
        axes.plot(*_columns(marks), color=colour, marker=mark, linewidth=1, label=label)
        lowest = min([lowest, *(value for _, value in marks)])
    return lowest


def draw_references(axes: Any, references: list[Reference], rate: str, over_esn0: bool) -> float:
    """Lines with open marks. Returns the lowest mark."""
    lowest = 1.0
    for index, reference in enumerate(references):
        shift = 10 * math.log10(reference.bits_per_symbol) if over_esn0 else 0
        marks = [(ebn0 + shift, value) for ebn0, value in reference.rates[rate]]
        colour, dashes, mark = _REFERENCE_STYLES[index % len(_REFERENCE_STYLES)]
        axes.plot(
            *_columns(marks), color=colour, linestyle=dashes, marker=mark, fillstyle="none", linewidth=1,
            label=reference.label,
        )  # fmt: skip
        lowest = min([lowest, *(value for _, value in marks)])
    return lowest


def draw_uncoded(axes: Any, curves: list[Curve], rate: str) -> None:
    """BPSK without a code, whose Es/N0 is its Eb/N0; its block error rate where all blocks have one size."""
    sizes = {curve.information_bits for curve in curves}
    first, last = axes.get_xlim()
    at = np.linspace(first, last, 101) if rate == "ber" or len(sizes) == 1 else []
    wrong = [math.erfc(math.sqrt(10 ** (value / 10))) / 2 for value in at]
    bits = 1 if rate == "ber" else min(sizes)
    rates = [-math.expm1(bits * math.log1p(-value)) for value in wrong]
    axes.plot(at, rates, color="#a0a0a0", linewidth=1, label="uncoded BPSK")
    axes.set_xlim(first, last)


def frame(axes: Any, rate: str, lowest: float) -> None:
    """Name the axes, and end the logarithmic one at the decade below the lowest mark."""
    axes.set_yscale("log")
    axes.set_ylim(10.0 ** min(-1, math.floor(math.log10(lowest / 1.5))), 1)
    axes.set(xlabel="Eb/N0 [dB]", ylabel=_NAMES[rate])
    axes.grid(True, color="#d0d0d0", linewidth=0.4)


def _shift(curve: Curve) -> float:
    """From Eb/N0 to Es/N0, in dB."""
    return 10 * math.log10(bits_per_symbol(curve))


def _columns(marks: list[tuple[float, float]]) -> tuple[list[float], list[float]]:
    return [x for x, _ in marks], [y for _, y in marks]


def _colour(index: int, count: int) -> Any:
    if count <= len(_COLOURS):
        return _COLOURS[index]
    place = index / (count - 1) * (len(_LINE) - 1)
    return tuple(np.interp(place, range(len(_LINE)), _LINE[:, channel]) for channel in range(3))


def _interval(point: Point, rate: str) -> tuple[float, float]:
    """The 95 % interval of a rate above 0; that of bits does not reach 0."""
    if rate == "bler" or point.blocks < 2:
        low, high = getattr(point, f"{rate}_interval")
        return low, high
    squares = point.bit_error_squares - point.bit_errors**2 / point.blocks
    variance = max(squares / (point.blocks - 1), 0.0)
    square = _DEVIATIONS**2 * variance * point.blocks / point.bit_errors**2
    factor = 1 + square / 2 + math.sqrt(square * (1 + square / 4))
    return point.ber / factor, min(point.ber * factor, 1.0)


def _bound(curve: Curve, point: Point, rate: str) -> float:
    """The upper bound of a rate where no error was seen."""
    high = point.bler_interval[1]
    wrong = [other for other in curve.points if other.block_errors > 0]
    if rate == "bler" or not wrong:
        return high
    nearest = min(wrong, key=lambda other: abs(other.ebn0_db - point.ebn0_db))
    return high * nearest.bit_errors / nearest.block_errors / curve.information_bits
