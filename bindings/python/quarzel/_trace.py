# SPDX-License-Identifier: MIT
"""Traces as arrays, and their text form."""

from __future__ import annotations

import functools
import os
import re
from dataclasses import dataclass, field
from typing import Any, Optional, Union

import numpy as np
from numpy.typing import NDArray

from . import _core

Signals = dict[str, NDArray[np.int16]]

_INPUTS = {
    "itsSys [0]": "code1_sys",
    "itsPar0[0]": "code1_par0",
    "itsPar1[0]": "code1_par1",
    "itsSys [1]": "code2_sys",
    "itsPar0[1]": "code2_par0",
    "itsPar1[1]": "code2_par1",
}
_SIGNALS = _core.signals()
_BEFORE_A_GAP = ("a", "b", "g", "llr")
_RULER = re.compile(r"^-{20,}\n", re.MULTILINE)
_TERMINATION_STEPS = 3
_WORDS_A_UNIT = 16
_UNITS_A_REAL = 8


@dataclass(eq=False, repr=False)
class BlockTrace:
    """Every value of the passes of a block, in units of 1/8.

    State metrics wrap around at 12 bits; only their differences within a step mean something. Two traces are equal
    when their block numbers, inputs and passes are; the bits do not count, since a file does not hold them.

    >>> soft = np.full((3, 44), -8, dtype=np.int8)
    >>> trace = quarzel.Decoder().trace(soft)
    >>> trace == quarzel.Decoder(units=8).trace(soft)
    True
    >>> trace.passes[-1]["a"].shape
    (43, 8)
    """

    block: int
    """blocks that the decoder has decoded before this one"""
    inputs: Signals
    """soft inputs of both constituent codes, (K + 3,) each: ``code1_sys``, ``code1_par0`` ... ``code2_par1``"""
    passes: list[Signals] = field(default_factory=list)
    """one entry a pass; an even pass decodes constituent code 2, an odd one constituent code 1. Each has
    ``int``, ``llr`` and ``ext`` (K + 3,), ``a`` and ``b`` (K + 3, 8) by encoder state, ``g`` (K + 3, 4)"""
    bits: Optional[NDArray[np.uint8]] = None
    """(K,) hard decisions; None for a trace that was read from a file"""

    def __repr__(self) -> str:
        K = len(self.inputs["code1_sys"]) - _TERMINATION_STEPS
        return f"<BlockTrace: block {self.block}, K = {K}, {len(self.passes)} passes>"

    def __eq__(self, other: object) -> bool:
        if not isinstance(other, BlockTrace):
            return NotImplemented
        return (
            self.block == other.block
            and len(self.passes) == len(other.passes)
            and all(map(_alike, [self.inputs, *self.passes], [other.inputs, *other.passes]))
        )

    @functools.cached_property
    def text(self) -> str:
        """The same as text, as the tool writes and compares it. It is made when it is asked for first."""
        words = {label: self.inputs[name].astype(np.int32) * _WORDS_A_UNIT for label, name in _INPUTS.items()}
        lines = [f"{label}=[{' '.join(map(str, values.tolist()))}]\n" for label, values in words.items()]
        tables = [
            f"{'-' * 289}\ndecode={self.block} siso={number}\n{_heading()}{_rows_text(signals)}"
            for number, signals in enumerate(self.passes)
        ]
        return "".join(["-" * 120 + "\n", *lines, *tables])

    def save(self, path: Union[str, os.PathLike[str]]) -> None:
        """Write the text form to a file, for ``quarzel trace-diff``.

        >>> quarzel.Decoder().trace(np.full((3, 44), -8, dtype=np.int8), passes=1).save("model.txt")
        """
        with open(path, "w", encoding="ascii", newline="\n") as file:
            file.write(self.text)


def trace_of_arrays(
    block: int, inputs: NDArray[np.int16], signals: Signals, bits: NDArray[np.uint8]
) -> BlockTrace:
    """The trace of arrays as the extension gives them: inputs (2, 3, K + 3), and signals by pass first."""
    passes = [{name: values[i] for name, values in signals.items()} for i in range(len(signals["int"]))]
    return BlockTrace(block, dict(zip(_INPUTS.values(), inputs.reshape(6, -1))), passes, bits)


def read_trace(path: Union[str, os.PathLike[str]]) -> list[BlockTrace]:
    """The blocks of a file in the text form, from ``quarzel decode --trace`` or :meth:`BlockTrace.save`.

    :raises ValueError: the file is not a trace of the model

    >>> trace = quarzel.Decoder().trace(np.full((3, 44), -8, dtype=np.int8))
    >>> trace.save("model.txt")
    >>> quarzel.read_trace("model.txt") == [trace]
    True
    """
    with open(path, encoding="ascii") as file:
        before, *tables = _RULER.split(file.read())
    if before or not tables:
        raise ValueError(f"not a trace of the model: it begins with {before[:40]!r} instead of a ruler")
    blocks: list[BlockTrace] = []
    for table in tables:
        if table.startswith("itsSys"):
            blocks.append(BlockTrace(-1, dict(map(_input_line, table.splitlines()))))
        elif table.startswith("decode=") and blocks:
            heading, _, rows = table.split("\n", 2)
            blocks[-1].block = int(heading.split()[0].removeprefix("decode="))
            blocks[-1].passes.append(_signals(rows, len(blocks[-1].inputs["code1_sys"])))
        else:
            raise ValueError(f"not a trace of the model: {table[:40]!r} follows a ruler")
    return blocks


def _alike(ours: Signals, theirs: Signals) -> bool:
    return ours.keys() == theirs.keys() and all(np.array_equal(ours[name], theirs[name]) for name in ours)


def _input_line(line: str) -> tuple[str, NDArray[np.int16]]:
    label, _, words = line.partition("=[")
    if label not in _INPUTS or not words.endswith("]"):
        raise ValueError(f"not a trace of the model: {line[:40]!r} is not a line of soft inputs")
    return _INPUTS[label], np.array(words[:-1].split(), dtype=np.int32).astype(np.int16) // _WORDS_A_UNIT


def _signals(rows: str, steps: int) -> Signals:
    columns = 1 + sum(width for _, _, width in _SIGNALS)
    reals = np.fromstring(rows, sep=" ")
    if reals.size != steps * columns:
        raise ValueError(f"not a whole trace of the model: a pass has {reals.size} numbers, not {steps * columns}")
    values = np.rint(reals.reshape(steps, columns) * _UNITS_A_REAL).astype(np.int16)
    signals: Signals = {}
    column = 1
    for name, _, width in _SIGNALS:
        signals[name] = values[:, column] if width == 1 else values[:, column : column + width]
        column += width
    return signals


def _heading() -> str:
    """The headings of a pass's columns."""
    text = "n    "
    for name, first, width in _SIGNALS:
        text += "  " if name in _BEFORE_A_GAP else ""
        text += "".join(f"{name}{first + i if width > 1 else '':<{12 - len(name)}}" for i in range(width))
    return text.rstrip() + "\n"


@functools.cache
def _reals() -> NDArray[Any]:
    """The text of every value of the format, from the least one up."""
    return np.array([f"{value / _UNITS_A_REAL:<+12.6f}" for value in range(-2048, 2048)], dtype="S12")


def _rows_text(signals: Signals) -> str:
    """A row for each step of a pass, every column of a fixed width."""
    columns: list[Any] = [("step", "S5")]
    for name, _, width in _SIGNALS:
        columns += [(f"before {name}", "S2")] if name in _BEFORE_A_GAP else []
        columns.append((name, "S12", (width,)))
    rows = np.empty(len(signals["int"]), dtype=[*columns, ("end", "S1")])
    rows["step"] = [f"{step:<5}" for step in range(len(rows))]
    for name in _BEFORE_A_GAP:
        rows[f"before {name}"] = "  "
    for name, _, width in _SIGNALS:
        rows[name] = _reals()[signals[name].reshape(-1, width) + 2048]
    rows["end"] = "\n"
    return rows.tobytes().decode("ascii")
