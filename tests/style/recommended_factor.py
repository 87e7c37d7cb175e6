#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""The factor that the header recommends loses at most twice the blocks of the best one in the stored measurements, for
every block size and algorithm type: recommended_factor.py SOURCE"""
import csv
import pathlib
import re
import sys


def rates(path):
    """The block error rates of a file by block size and algorithm type, and in these by factor."""
    found = {}
    with path.open(encoding="utf-8") as file:
        for row in csv.DictReader(file):
            by_factor = found.setdefault((int(row["block_size"]), int(row["algorithm"])), {})
            by_factor[float(row["scale"])] = int(row["block_errors"]) / int(row["blocks"])
    return found


def main():
    source = pathlib.Path(sys.argv[1])
    header = (source / "include/vardel_ip_quarzel.h").read_text(encoding="utf-8")
    recommended = float(re.search(r"define VARDEL_IP_QUARZEL_LLR_SCALE (\S+)", header)[1])
    measured = set()
    for path in sorted((source / "docs/quantiser").glob("rate_*.csv")):
        for (K, algorithm), by_factor in rates(path).items():
            measured.add((K, algorithm))
            best = min(by_factor, key=by_factor.get)
            times = by_factor[recommended] / by_factor[best]
            print(f"{path.name}: K = {K}, type {algorithm}: {times:.2f} times the rate with {best:g}")
            if times > 2:
                sys.exit(f"a factor of {recommended:g} loses too many blocks")
    if measured != {(K, algorithm) for K in (40, 1024, 6144) for algorithm in (0, 1, 2)}:
        sys.exit("a block size or an algorithm type is not measured")


if __name__ == "__main__":
    main()
