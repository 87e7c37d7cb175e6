# SPDX-License-Identifier: MIT
"""Results of sweeps."""

from __future__ import annotations

import json
import os
from typing import Any, Literal, Union

from ._curve import Curve, Point, curve_of
from ._drawing import draw, new_figure
from ._link import USUAL
from ._optional import optional_module, sweep_extension


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
        self.curves: list[Curve] = [curve_of(curve) for curve in document["curves"]]
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
            return cls(sweep_extension().renew(file.read()))

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
        pandas = optional_module(
            "pandas", "to_dataframe needs pandas; install it, or read the points of SweepResult.curves"
        )
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
