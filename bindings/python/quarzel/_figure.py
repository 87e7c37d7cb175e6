# SPDX-License-Identifier: MIT
"""Figures of sweeps, as ``quarzel plot`` draws them."""

from __future__ import annotations

import dataclasses
import math
from typing import Any, Iterable, Literal, Optional, Union

import numpy as np

from ._simulation import Curve, Point, SweepResult, _optional

_COLOURS = ("#0072b2", "#d55e00", "#009e73", "#cc79a7", "#000000", "#e69f00", "#56b4e9")
"""People with any kind of colour vision tell them apart (M. Okabe and K. Ito, 2008)."""
_LINE = np.array([(13, 8, 135), (100, 0, 167), (166, 32, 152), (213, 84, 110), (245, 136, 70), (245, 185, 40)]) / 255
"""Corners of a line of colours, which grow lighter: for more curves."""
_MARKS = ("o", "s", "^", "D", "p")
_DEVIATIONS = 1.959963984540054
_DECIBELS_OF_RATE = 10 * math.log10(1 / 3)
_NAMES = {"ber": "Bit error rate", "bler": "Block error rate"}


def plot(
    results: Union[SweepResult, Iterable[SweepResult]],
    *,
    panel: Literal["ber", "bler", "both"] = "both",
    x: Literal["ebn0", "esn0"] = "ebn0",
    uncoded: bool = False,
    size: Optional[tuple[float, float]] = None,
    font_size: float = 10,
    title: Optional[str] = None,
    labels: Optional[Iterable[str]] = None,
    legend: str = "right",
) -> Any:
    """Draw the error rates of sweeps as ``quarzel plot`` draws them. Needs Matplotlib.

    Bars hold the true rate with a probability of 95 %. Where no error was seen, a triangle stands at the upper
    bound, and no line leads there. Curves that were measured alike over several ranges are one line.

    :param panel: which rates
    :param x: over Eb/N0, or over Es/N0 of a BPSK symbol at rate 1/3
    :param uncoded: draw the bit error rate of BPSK without a code too
    :param size: width and height in inches
    :param font_size: in points
    :param title: what the curves share when not given
    :param labels: of the curves; what they differ in when not given
    :param legend: ``"right"`` of the panels, or a place in the last one as Matplotlib names it: ``"lower left"``
    :returns: the Matplotlib figure
    :raises ValueError: there is no such panel or axis, no curve, or not a label for each
    :raises ImportError: Matplotlib is not installed

    >>> figure = quarzel.plot(quarzel.sweep([0.0, 1.0], block_size=40, max_blocks=20), panel="bler", size=(3.5, 2.6))
    >>> figure.savefig("curves.pdf")
    """
    if panel not in ("ber", "bler", "both"):
        raise ValueError(f"there is no panel {panel!r}; choose 'ber', 'bler' or 'both'")
    if x not in ("ebn0", "esn0"):
        raise ValueError(f"there is no axis {x!r}; choose 'ebn0' or 'esn0'")
    rates = ["ber", "bler"] if panel == "both" else [panel]
    shared, curves = _labelled([results] if isinstance(results, SweepResult) else list(results))
    if labels is not None:
        texts = list(labels)
        if len(texts) != len(curves):
            raise ValueError(f"the labels are {len(texts)} and the curves {len(curves)}; give one for each")
        curves = [(text, curve) for text, (_, curve) in zip(texts, curves)]
    matplotlib = _optional("matplotlib", "plot needs Matplotlib; install it, or use 'quarzel plot'")
    with matplotlib.rc_context({"font.size": font_size, "pdf.fonttype": 42, "lines.markersize": font_size / 2}):
        height = max(4.3, (len(curves) + 5) * 1.5 * font_size / 72)
        figure = new_figure(size or (11 if len(rates) > 1 else 7, height))
        for index, rate in enumerate(rates):
            axes = figure.add_subplot(1, len(rates), index + 1)
            draw(axes, curves, rate, _DECIBELS_OF_RATE if x == "esn0" else 0)
            axes.set_xlabel("$E_s/N_0$ (dB)" if x == "esn0" else "$E_b/N_0$ (dB)")
            if uncoded and rate == "ber":
                first, last = axes.get_xlim()
                at = np.linspace(first, last, 101)
                wrong = [math.erfc(math.sqrt(10 ** (value / 10))) / 2 for value in at]
                axes.plot(at, wrong, color="#a0a0a0", linewidth=1, label="uncoded BPSK")
                axes.set_xlim(first, last)
        handles = _legend_of(figure.axes[0])
        if legend == "right":
            figure.axes[-1].legend(*handles, loc="upper left", bbox_to_anchor=(1.02, 1), borderaxespad=0, frameon=False)
        else:
            figure.axes[-1].legend(*handles, loc=legend)
        figure.suptitle(shared if title is None else title, fontsize=font_size)
    return figure


def new_figure(size: Optional[tuple[float, float]] = None) -> Any:
    """An empty figure."""
    pyplot = _optional("matplotlib.pyplot", "plot needs Matplotlib; install it, or use 'quarzel plot'")
    return pyplot.figure(figsize=size, layout="constrained")


def draw(axes: Any, curves: list[tuple[str, Curve]], rate: str, shift: float = 0) -> None:
    """Draw a rate of labelled curves into axes.

    :param shift: from Eb/N0 to the horizontal axis, in dB
    """
    lowest = 1.0
    for index, (label, curve) in enumerate(curves):
        colour = _colour(index, len(curves))
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
    axes.set_yscale("log")
    axes.set_ylim(10.0 ** min(-1, math.floor(math.log10(lowest / 1.5))), 1)
    axes.set(xlabel="Eb/N0 [dB]", ylabel=_NAMES[rate])
    axes.grid(True, color="#d0d0d0", linewidth=0.4)


def _legend_of(axes: Any) -> tuple[list[Any], list[str]]:
    """Handles and texts, measured curves first, which Matplotlib puts last."""
    handles, texts = axes.get_legend_handles_labels()
    order = sorted(range(len(texts)), key=lambda index: handles[index] not in axes.containers)
    return [handles[index] for index in order], [texts[index] for index in order]


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
    return high * nearest.bit_errors / nearest.block_errors / curve.block_size


def _labelled(results: list[SweepResult]) -> tuple[str, list[tuple[str, Curve]]]:
    """What all curves share, and each curve with what it differs in; those measured alike are joined."""
    joined: list[tuple[tuple[str, ...], Curve]] = []
    for number, result in enumerate(results, 1):
        for curve in result.curves:
            key = (*_setup(curve), f"seed {result.seed}", f"result {number}")
            for index, (other, former) in enumerate(joined):
                if other[:-2] == key[:-2] and _can_join(former, curve, other[-2] == key[-2]):
                    joined[index] = other, _join(former, curve)
                    break
            else:
                joined.append((key, curve))
    if not joined:
        raise ValueError("there is no curve; give the result of a sweep")
    keys = [key for key, _ in joined]
    fields = len(keys[0]) - 2
    differing = [index for index in range(fields) if len({key[index] for key in keys}) > 1]
    title = ", ".join(keys[0][index] for index in range(fields) if index not in differing)
    for last in (fields, fields + 1):  # the seed and the result, where nothing else tells curves apart
        if len({tuple(key[index] for index in differing) for key in keys}) < len(keys):
            differing.append(last)
    labels = [", ".join(key[index] for index in differing) or "quarzel" for key in keys]
    return title, [(label, curve) for label, (_, curve) in zip(labels, joined)]


def _can_join(a: Curve, b: Curve, have_one_seed: bool) -> bool:
    """Whether curves of one setup are one measurement: not two of the same point."""
    former = {point.ebn0_db: point for point in a.points}
    common = [(former[point.ebn0_db], point) for point in b.points if point.ebn0_db in former]
    return not common or (have_one_seed and all(x.blocks != y.blocks or x.bit_errors == y.bit_errors for x, y in common))


def _join(a: Curve, b: Curve) -> Curve:
    """The points of both; where both have one, that with more blocks."""
    longest = {point.ebn0_db: point for point in sorted([*a.points, *b.points], key=lambda point: point.blocks)}
    points = sorted(longest.values(), key=lambda point: point.ebn0_db)
    return dataclasses.replace(a, points=points)


def _setup(curve: Curve) -> tuple[str, ...]:
    """What a curve was measured with, in the order in which it is told."""
    return (
        f"K = {curve.block_size}",
        f"{curve.units} units",
        curve.algorithm.replace("scaled-max-log", "scaled max-log"),
        f"{curve.iterations} iteration{'s' * (curve.iterations > 1)}",
        f"{'LLR' if curve.quantiser == 'llr' else 'amplitude'} \u00d7 {curve.scale:g}",
    )
