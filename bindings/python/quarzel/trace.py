# SPDX-License-Identifier: MIT
"""Traces as arrays."""

from __future__ import annotations

import os
import re
from dataclasses import dataclass, field
from typing import Optional, Union

import numpy as np
from numpy.typing import NDArray

Signals = dict[str, NDArray[np.int16]]

_INPUTS = {
    "itsSys [0]": "code1_sys",
    "itsPar0[0]": "code1_par0",
    "itsPar1[0]": "code1_par1",
    "itsSys [1]": "code2_sys",
    "itsPar0[1]": "code2_par0",
    "itsPar1[1]": "code2_par1",
}
_COLUMNS = {"int": 1, "a": 8, "b": 8, "g": 4, "llr": 1, "ext": 1}
_RULER = re.compile(r"^(-{20,}\n)", re.MULTILINE)
_WORDS_A_UNIT = 16
_UNITS_A_REAL = 8


@dataclass
class BlockTrace:
    """Every value of the passes of a block, in units of 1/8.

    State metrics wrap around at 12 bits; only their differences within a step mean something.
    """

    block: int
    """blocks that the decoder has decoded before this one"""
    inputs: Signals
    """soft inputs of both constituent codes, (K + 3,) each: ``code1_sys``, ``code1_par0`` ... ``code2_par1``"""
    passes: list[Signals] = field(default_factory=list)
    """one entry a pass; an even pass decodes constituent code 2, an odd one constituent code 1. Each has
    ``int``, ``llr`` and ``ext`` (K + 3,), ``a`` and ``b`` (K + 3, 8) by encoder state, ``g`` (K + 3, 4)"""
    text: str = ""
    """the same as text, as the tool writes and compares it"""
    bits: Optional[NDArray[np.uint8]] = None
    """(K,) hard decisions; None for a trace that was read from a file"""

    def save(self, path: Union[str, os.PathLike[str]]) -> None:
        """Write the text form to a file, for ``quarzel trace-diff``."""
        with open(path, "w", encoding="ascii", newline="\n") as file:
            file.write(self.text)


def read_trace(path: Union[str, os.PathLike[str]]) -> list[BlockTrace]:
    """The blocks of a file in the text form, from ``quarzel decode --trace`` or :meth:`BlockTrace.save`."""
    with open(path, encoding="ascii") as file:
        return parse_trace(file.read())


def parse_trace(text: str) -> list[BlockTrace]:
    """The blocks of a trace in the text form.

    :raises ValueError: the text is no trace of the model
    """
    blocks: list[BlockTrace] = []
    before, *tables = _RULER.split(text)
    for ruler, table in zip(tables[::2], tables[1::2]):
        if table.startswith("itsSys"):
            blocks.append(BlockTrace(-1, dict(map(_input_line, table.splitlines()))))
        elif table.startswith("decode=") and blocks:
            heading, _, rows = table.split("\n", 2)
            blocks[-1].block = int(heading.split()[0].removeprefix("decode="))
            blocks[-1].passes.append(_signals(rows, len(blocks[-1].inputs["code1_sys"])))
        else:
            raise ValueError(f"no trace of the model: {table[:40]!r} follows a ruler")
        blocks[-1].text += ruler + table
    if before or not blocks:
        raise ValueError(f"no trace of the model: it begins with {before[:40]!r} instead of a ruler")
    return blocks


def _input_line(line: str) -> tuple[str, NDArray[np.int16]]:
    label, _, words = line.partition("=[")
    if label not in _INPUTS or not words.endswith("]"):
        raise ValueError(f"no trace of the model: {line[:40]!r} is no line of soft inputs")
    return _INPUTS[label], np.array(words[:-1].split(), dtype=np.int32).astype(np.int16) // _WORDS_A_UNIT


def _signals(rows: str, steps: int) -> Signals:
    columns = 1 + sum(_COLUMNS.values())
    reals = np.fromstring(rows, sep=" ")
    if reals.size != steps * columns:
        raise ValueError(f"no whole trace of the model: a pass has {reals.size} numbers, not {steps * columns}")
    values = np.rint(reals.reshape(steps, columns) * _UNITS_A_REAL).astype(np.int16)
    signals: Signals = {}
    column = 1
    for name, width in _COLUMNS.items():
        signals[name] = values[:, column] if width == 1 else values[:, column : column + width]
        column += width
    return signals
