# SPDX-License-Identifier: MIT
"""Figures of sweeps, as ``quarzel plot`` draws them."""

from __future__ import annotations

from typing import Any, Iterable, Literal, Optional, Union

from ._checks import whole
from ._curve import Curve
from ._drawing import draw_iterations, draw_measured, draw_references, draw_uncoded, frame, new_figure
from ._labels import Results, labelled, longest
from ._link import listed
from ._optional import optional_module
from ._reference import References, read_references


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
    matplotlib = optional_module("matplotlib", "plot needs Matplotlib; install it, or use 'quarzel plot'")
    with matplotlib.rc_context({"font.size": font_size, "pdf.fonttype": 42, "lines.markersize": font_size / 2}):
        height = max(4.3, (count + len(elsewhere) + 5) * 1.5 * font_size / 72)
        figure = new_figure(size or (11 if len(rates) > 1 else 7, height))
        for index, rate in enumerate(rates):
            axes = figure.add_subplot(1, len(rates), index + 1)
            if per_iteration:
                lowest = draw_iterations(axes, curves[0][1], lines, texts, rate, x == "esn0")
            else:
                drawn = curves if texts is None else [(text, curve) for text, (_, curve) in zip(texts, curves)]
                lowest = draw_measured(axes, drawn, rate, x == "esn0")
            lowest = min(lowest, draw_references(axes, elsewhere, rate, x == "esn0"))
            frame(axes, rate, lowest)
            axes.set_xlabel("$E_s/N_0$ (dB)" if x == "esn0" else "$E_b/N_0$ (dB)")
            if x_range is not None:
                axes.set_xlim(*x_range)
            if uncoded:
                draw_uncoded(axes, [curve for _, curve in curves], rate)
            if y_range is not None:
                axes.set_ylim(*y_range)
        handles = _legend_of(figure.axes[0])
        if legend == "right":
            figure.axes[-1].legend(*handles, loc="upper left", bbox_to_anchor=(1.02, 1), borderaxespad=0, frameon=False)
        else:
            figure.axes[-1].legend(*handles, loc=legend)
        figure.suptitle(shared if title is None else title, fontsize=font_size)
    return figure


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


def _legend_of(axes: Any) -> tuple[list[Any], list[str]]:
    """Handles and texts, measured curves first, which Matplotlib puts last."""
    handles, texts = axes.get_legend_handles_labels()
    order = sorted(range(len(texts)), key=lambda index: handles[index] not in axes.containers)
    return [handles[index] for index in order], [texts[index] for index in order]
