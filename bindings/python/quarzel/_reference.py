# SPDX-License-Identifier: MIT
"""Error rates from elsewhere, in the form that ``quarzel plot --reference`` takes."""

from __future__ import annotations

import csv
import math
import os
from dataclasses import dataclass, field
from pathlib import Path
from typing import Iterable, Mapping, Optional, Union

from ._link import MODULATIONS

File = Union[str, os.PathLike[str]]
References = Union[File, Iterable[File], Mapping[str, File]]

_REMEDY = "give CSV with the columns ebn0_db and ber, bler or both"
_SETUP = ("K", "decoder", "iterations", "modulation", "channel", "code_bits", "source")
"""The columns that tell curves apart, in the order in which labels name them."""
_TEXTS = {"K": "K = {}", "iterations": "{} iterations", "code_bits": "{} code bits"}


@dataclass
class Reference:
    """A curve: points of Eb/N0 in dB and an error rate."""

    label: str
    setup: dict[str, str]
    rates: dict[str, list[tuple[float, float]]] = field(default_factory=lambda: {"ber": [], "bler": []})

    @property
    def block_size(self) -> Optional[int]:
        """K, where the file tells it."""
        return int(self.setup["K"]) if self.setup["K"] else None

    @property
    def bits_per_symbol(self) -> float:
        """Information bits a symbol.

        :raises ValueError: the file does not tell it
        """
        if not (self.setup["K"] and self.setup["code_bits"]):
            raise ValueError(
                f"the reference {self.label!r} does not tell its code rate; give it the columns K and code_bits"
            )
        modulation = self.setup["modulation"].lower() or "bpsk"
        if modulation not in MODULATIONS:
            raise ValueError(
                f"{self.setup['modulation']!r} is not a modulation; give BPSK, QPSK, 16QAM, 64QAM or 256QAM"
            )
        return int(self.setup["K"]) / int(self.setup["code_bits"]) * MODULATIONS[modulation]


def read_references(references: References) -> list[Reference]:
    """The curves of files, each labelled with the name of its file or the one given.

    :raises ValueError: a file is not well-formed
    """
    if isinstance(references, Mapping):
        named = [(label, Path(file)) for label, file in references.items()]
    else:
        files = [references] if isinstance(references, (str, os.PathLike)) else references
        named = [(Path(file).stem, Path(file)) for file in files]
    return [curve for label, file in named for curve in _curves(label, file)]


def _curves(label: str, file: Path) -> list[Reference]:
    """Rows that differ in a column of the setup are points of different curves."""
    curves: dict[tuple[str, ...], Reference] = {}
    with open(file, encoding="utf-8", newline="") as stream:
        lines = [(number, line) for number, line in enumerate(stream, 1) if line.strip() and not line.startswith("#")]
    reader = csv.DictReader((line for _, line in lines), skipinitialspace=True)
    columns = {name.strip() for name in reader.fieldnames or []}
    has_ber = "ber" in columns or {"bit_errors", "blocks", "K"} <= columns
    has_bler = "bler" in columns or {"block_errors", "blocks"} <= columns
    if "ebn0_db" not in columns or not (has_ber or has_bler):
        raise ValueError(f"{file}: is missing a column; {_REMEDY}")
    for (number, _), fields in zip(lines[1:], reader):
        where = f"{file}: line {number}"
        if None in fields or None in fields.values():
            raise ValueError(f"{where}: has not as many fields as the header; {_REMEDY}")
        row = {name.strip(): text.strip() for name, text in fields.items()}
        setup = {name: row.get(name, "") for name in _SETUP}
        for name in ("K", "code_bits"):
            if setup[name]:
                _count(setup[name], where)
        curve = curves.setdefault(tuple(setup.values()), Reference(label, setup))
        ebn0 = _number(row["ebn0_db"], where)
        bits = row["K"] if has_ber and "K" in row else ""
        for rate, errors, size in (("ber", "bit_errors", bits), ("bler", "block_errors", "1")):
            value = _rate(row, rate, errors, size, where)
            if value is not None:
                curve.rates[rate].append((ebn0, value))
    found = [curve for curve in curves.values() if any(curve.rates.values())]
    if not found:
        raise ValueError(f"{file}: holds no point; {_REMEDY}")
    _tell_apart(found)
    return found


def _rate(row: dict[str, str], rate: str, errors: str, bits_per_block: str, where: str) -> Optional[float]:
    """A rate from its own column or from counts. A field of counts may also be a rate and say so: "0.13 (rate)"."""
    text = row.get(rate, "")
    counted = row.get(errors, "") if bits_per_block else ""
    if not text and counted.endswith(" (rate)"):
        text = counted.removesuffix(" (rate)")
    if text:
        value = _number(text, where)
        if not 0 < value <= 1:
            raise ValueError(
                f"{where}: {text} is not an error rate on a logarithmic axis; give a number above 0 and up to 1, or "
                "leave it out"
            )
        return value
    if not counted:
        return None
    count = _number(counted, where)
    trials = _count(row.get("blocks", ""), where) * _count(bits_per_block, where)
    if not 0 <= count <= trials:
        raise ValueError(f"{where}: {counted} is not a count of errors in {trials}; {_REMEDY}")
    return count / trials or None


def _number(text: str, where: str) -> float:
    try:
        value = float(text)
    except ValueError:
        value = math.nan
    if not math.isfinite(value):
        raise ValueError(f"{where}: {text!r} is not a number; {_REMEDY}")
    return value


def _count(text: str, where: str) -> int:
    if not text.isdecimal() or int(text) == 0:
        raise ValueError(f"{where}: {text!r} is not a count; {_REMEDY}")
    return int(text)


def _tell_apart(curves: list[Reference]) -> None:
    """Add as few columns to the labels as are enough."""
    for name in _SETUP:
        if len({curve.label for curve in curves}) < len(curves) and len({curve.setup[name] for curve in curves}) > 1:
            for curve in curves:
                curve.label += ", " + _TEXTS.get(name, "{}").format(curve.setup[name])
