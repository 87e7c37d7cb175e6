# SPDX-License-Identifier: MIT
"""Write the tables of the validation page anew: validation_tables.py QUARZEL PAGE

A table stands between <!-- table: ... --> and <!-- end -->. The comment names its curves, one after another with "|"
between them; the first one is what the others are compared with. A curve is a file beside the page's folder with rows of
counts, "FILE: DECODER, K[, CHANNEL]", or a result of sweeps, "FILE.json: algorithm A".
"""

import csv
import io
import math
import re
import subprocess
import sys
from pathlib import Path

RATES = (0.1, 0.01)


def points_of(quarzel, folder, curve):
    """Eb/N0, rate and the variance of the rate's logarithm, of the points of a curve."""
    file, _, chosen = curve.partition(": ")
    path = folder / file
    if path.suffix == ".json":
        text = subprocess.run([quarzel, "show", path, "--csv"], check=True, capture_output=True, text=True).stdout
        rows = [row for row in csv.DictReader(io.StringIO(text)) if f"algorithm {row['algorithm']}" == chosen]
    else:
        decoder, K, channel = re.fullmatch(r"(.*), (\d+), (\w+)", chosen).groups()
        rows = [
            row
            for row in csv.DictReader(path.open())
            if row["decoder"] == decoder and row["K"] == K and row["channel"] == channel
        ]
    if not rows:
        sys.exit(f"{curve} has no points")
    for row in rows:
        if row["block_errors"].endswith("(rate)"):  # no counts were given
            yield float(row["ebn0_db"]) - tail_shift(row), float(row["block_errors"].split()[0]), 0.0
        elif int(row["block_errors"]) > 0:
            blocks, errors = int(row["blocks"]), int(row["block_errors"])
            yield float(row["ebn0_db"]) - tail_shift(row), errors / blocks, (1 - errors / blocks) / errors


def tail_shift(row):
    """By how much Eb/N0 is greater where the tail bits are charged to the information bits."""
    if not row.get("source", "").startswith("aff3ct"):
        return 0.0
    K = int(row["K"])
    return 10 * math.log10((3 * K + 12) / (3 * K))


def crossing(points, rate):
    """The Eb/N0 where a curve has a rate, and half its 95 % interval; the logarithm of the rate is taken as straight."""
    points = sorted(points)
    for (x0, r0, v0), (x1, r1, v1) in zip(points, points[1:]):
        if r0 >= rate > r1:
            slope = (math.log(r1) - math.log(r0)) / (x1 - x0)
            share = (math.log(rate) - math.log(r0)) / (math.log(r1) - math.log(r0))
            deviation = math.sqrt((1 - share) ** 2 * v0 + share**2 * v1) / abs(slope)
            return x0 + share * (x1 - x0), 1.96 * deviation
    return None


def table(quarzel, folder, curves):
    lines = ["| curve | " + " | ".join(f"Eb/N0 at {rate:g} | difference" for rate in RATES) + " |"]
    lines.append("|---|" + "---|---|" * len(RATES))
    first = None
    for curve in curves:
        found = [crossing(points_of(quarzel, folder, curve), rate) for rate in RATES]
        first = first or found
        file, _, chosen = curve.partition(": ")
        cells = [re.sub(r", \d+, \w+$", "", chosen) + (" (published)" if file == "published.csv" else "")]
        for here, there in zip(found, first):
            cells.append(f"{here[0]:.3f} ± {here[1]:.3f} dB" if here else "not reached")
            cells.append("" if found is first or not here or not there else f"{here[0] - there[0]:+.3f} dB")
        lines.append("| " + " | ".join(cells) + " |")
    return "\n".join(lines)


def main():
    quarzel, page = sys.argv[1], Path(sys.argv[2])
    folder = page.with_suffix("")

    def renewed(match):
        return f"{match[1]}\n\n{table(quarzel, folder, match[2].split(' | '))}\n\n<!-- end -->"

    text = page.read_text(encoding="utf-8")
    page.write_text(
        re.sub(r"(<!-- table: (.*?) -->).*?<!-- end -->", renewed, text, flags=re.DOTALL), encoding="utf-8"
    )


if __name__ == "__main__":
    main()
