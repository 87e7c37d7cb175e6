#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Proves the lemmas of docs/lanes.md over the trellis table and the numbers of the sources: lane_bounds.py SOURCE

Each is shown twice: no values break it at its bound, and some do at the next one, or at the named one.
"""
import sys

from ratio_bounds import RatioBounds
from source_numbers import Sources
from step_bounds import StepBounds

LIMIT = 120


def main():
    sources = Sources(sys.argv[1])
    steps = StepBounds(sources, LIMIT)
    steps.steps()
    steps.words()
    steps.starts()
    steps.recursions()
    ratios = RatioBounds(sources, LIMIT)
    ratios.ratios()
    ratios.known_start()
    ratios.tail()
    return 1 if steps.failures + ratios.failures else 0


if __name__ == "__main__":
    sys.exit(main())
