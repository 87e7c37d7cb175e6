# SPDX-License-Identifier: MIT
"""Figures of sweeps, as ``quarzel plot`` draws them."""

from __future__ import annotations

import math
from typing import Any, Iterable, Literal, Optional, Union

import numpy as np

from ._checks import whole
from ._labels import Results, labelled, longest
from ._link import bits_per_symbol, listed
from ._reference import Reference, References, read_references
from ._simulation import Curve, Point, _optional

_COLOURS = ("#0072b2", "#d55e00", "#009e73", "#cc79a7", "#000000", "#e69f00", "#56b4e9")
"""People with any kind of colour vision tell them apart (M. Okabe and K. Ito, 2008)."""
_LINE = np.array([(13, 8, 135), (100, 0, 167), (166, 32, 152), (213, 84, 110), (245, 136, 70), (245, 185, 40)]) / 255
"""Corners of a line of colours, which grow lighter: for more curves."""
_MARKS = ("o", "s", "^", "D", "p")
_REFERENCE_STYLES = (("#404040", "--", "s"), ("#808080", ":", "^"), ("#606060", "-.", "D"), ("#404040", "--", "p"))
_DEVIATIONS = 1.959963984540054
_NAMES = {"ber": "Bit error rate", "bler": "Block error rate"}


def plot(
    results: Results,
    *,
    panel: Literal["ber", "bler", "both"] = "both",
    x: Literal["ebn0", "esn0"] = "ebn0",
    block_size: Union[int, Iterable[int], None] = None,
    per_iteration: bool = False,
    iterations: Union[int, Iterable[int], None] = None,
    references: References = (),
    uncoded: bool = False,
    x_range: Optional[tuple[float, float]] = None,
    y_range: Optional[tuple[float, float]] = None,
    size: Optional[tuple[float, float]] = None,
    font_size: float = 10,
    title: Optional[str] = None,
    labels: Optional[Iterable[str]] = None,
    legend: str = "right",
) -> Any:
    """Draw the error rates of sweeps as ``quarzel plot`` draws them. Needs Matplotlib.

    Bars hold the true rate with a probability of 95 %. Where no error was seen, a triangle stands at the upper
    bound, and no line leads there. Curves that were measured alike over several ranges are one line.

    :param results: a result of :func:`sweep`, a curve of one, or several of these
    :param panel: which rates
    :param x: over Eb/N0, or over Es/N0 of a symbol of the channel
    :param block_size: draw only curves and references of these block sizes
    :param per_iteration: draw one curve, with a line for each iteration; points without an error are left out
    :param iterations: with ``per_iteration``, only these lines
    :param references: files of curves from elsewhere, or a dictionary from labels to them: CSV as ``quarzel plot
        --reference`` takes it
    :param uncoded: draw BPSK without a code too
    :param x_range: ends of the horizontal axis in dB
    :param y_range: ends of the vertical axes
    :param size: width and height in inches
    :param font_size: in points
    :param title: what the curves share when not given
    :param labels: of the curves; what they differ in when not given
    :param legend: ``"right"`` of the panels, or a place in the last one as Matplotlib names it: ``"lower left"``
    :returns: the Matplotlib figure
    :raises ValueError: there is no such panel or axis, no curve, not a label for each, or a reference is not
        well-formed
    :raises ImportError: Matplotlib is not installed

    >>> figure = quarzel.plot(quarzel.sweep([0.0, 1.0], block_size=40, max_blocks=20), panel="bler", size=(3.5, 2.6))
    >>> figure.savefig("curves.pdf")
    """
    if panel not in ("ber", "bler", "both"):
        raise ValueError(f"there is no panel {panel!r}; choose 'ber', 'bler' or 'both'")
    if x not in ("ebn0", "esn0"):
        raise ValueError(f"there is no axis {x!r}; choose 'ebn0' or 'esn0'")
    for name, ends in (("x_range", x_range), ("y_range", y_range)):
        if ends is not None and not ends[0] < ends[1]:
            raise ValueError(f"{name} must be two numbers in ascending order, not {ends}")
    if y_range is not None and y_range[0] <= 0:
        raise ValueError(f"y_range must be above 0, not {y_range}: the axis is logarithmic")
    rates = ["ber", "bler"] if panel == "both" else [panel]
    sizes = None if block_size is None else listed(block_size)
    shared, curves = labelled(results, sizes)
    elsewhere = [curve for curve in read_references(references) if sizes is None or curve.block_size in (None, *sizes)]
    if per_iteration:
        curves, lines = _lines(curves, iterations)
    texts = None if labels is None else list(labels)
    count = len(lines) if per_iteration else len(curves)
    if texts is not None and len(texts) != count:
        raise ValueError(f"the labels are {len(texts)} and the curves {count}; give one for each")
    matplotlib = _optional("matplotlib", "plot needs Matplotlib; install it, or use 'quarzel plot'")
    with matplotlib.rc_context({"font.size": font_size, "pdf.fonttype": 42, "lines.markersize": font_size / 2}):
        height = max(4.3, (count + len(elsewhere) + 5) * 1.5 * font_size / 72)
        figure = new_figure(size or (11 if len(rates) > 1 else 7, height))
        for index, rate in enumerate(rates):
            axes = figure.add_subplot(1, len(rates), index + 1)
            if per_iteration:
                lowest = _draw_iterations(axes, curves[0][1], lines, texts, rate, x == "esn0")
            else:
                drawn = curves if texts is None else [(text, curve) for text, (_, curve) in zip(texts, curves)]
                lowest = _draw_measured(axes, drawn, rate, x == "esn0")
            lowest = min(lowest, _draw_references(axes, elsewhere, rate, x == "esn0"))
            _frame(axes, rate, lowest)
            axes.set_xlabel("$E_s/N_0$ (dB)" if x == "esn0" else "$E_b/N_0$ (dB)")
            if x_range is not None:
                axes.set_xlim(*x_range)
            if uncoded:
                _draw_uncoded(axes, [curve for _, curve in curves], rate)
            if y_range is not None:
                axes.set_ylim(*y_range)
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


def draw(axes: Any, curves: list[tuple[str, Curve]], rate: str) -> None:
    """Draw a rate of labelled curves into axes."""
    _frame(axes, rate, _draw_measured(axes, curves, rate, False))


def _lines(curves: list[tuple[str, Curve]], wanted: Any) -> tuple[list[tuple[str, Curve]], list[int]]:
    """The only curve, and those of its iterations that are drawn."""
    (curve, *others) = longest([curve for _, curve in curves])
    if others:
        raise ValueError(f"there are {1 + len(others)} curves; give one of SweepResult.curves")
    if any(point.per_iteration is None for point in curve.points):
        raise ValueError("the curve has no error rates per iteration; make it with sweep(..., per_iteration=True)")
    every = range(1, curve.iterations + 1)
    chosen = every if wanted is None else [whole("iterations", value, 1, curve.iterations) for value in listed(wanted)]
    return [("", curve)], [count for count in every if count in chosen]


def _draw_measured(axes: Any, curves: list[tuple[str, Curve]], rate: str, over_esn0: bool) -> float:
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


def _draw_iterations(
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


def _draw_references(axes: Any, references: list[Reference], rate: str, over_esn0: bool) -> float:
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


def _draw_uncoded(axes: Any, curves: list[Curve], rate: str) -> None:
    """BPSK without a code, whose Es/N0 is its Eb/N0; its block error rate where all blocks have one size."""
    sizes = {curve.information_bits for curve in curves}
    first, last = axes.get_xlim()
    at = np.linspace(first, last, 101) if rate == "ber" or len(sizes) == 1 else []
    wrong = [math.erfc(math.sqrt(10 ** (value / 10))) / 2 for value in at]
    bits = 1 if rate == "ber" else min(sizes)
    rates = [-math.expm1(bits * math.log1p(-value)) for value in wrong]
    axes.plot(at, rates, color="#a0a0a0", linewidth=1, label="uncoded BPSK")
    axes.set_xlim(first, last)


def _frame(axes: Any, rate: str, lowest: float) -> None:
    axes.set_yscale("log")
    axes.set_ylim(10.0 ** min(-1, math.floor(math.log10(lowest / 1.5))), 1)
    axes.set(xlabel="Eb/N0 [dB]", ylabel=_NAMES[rate])
    axes.grid(True, color="#d0d0d0", linewidth=0.4)


def _shift(curve: Curve) -> float:
    """From Eb/N0 to Es/N0, in dB."""
    return 10 * math.log10(bits_per_symbol(curve))


def _columns(marks: list[tuple[float, float]]) -> tuple[list[float], list[float]]:
    return [x for x, _ in marks], [y for _, y in marks]


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
    return high * nearest.bit_errors / nearest.block_errors / curve.information_bits
