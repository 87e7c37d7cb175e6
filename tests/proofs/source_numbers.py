# SPDX-License-Identifier: MIT
"""The numbers of the sources that the bounds of the lanes rest on."""
import pathlib
import re


class Sources:
    """Numbers as they stand in the sources; a name that is not found is an error."""

    def __init__(self, root):
        self.root = pathlib.Path(root)
        table = self.find("engine/trellis.hpp", r"plusTarget\[states\] = \{([^}]*)\}")
        self.plus_target = [int(target) for target in table.split(",")]
        self.minus_target = [target ^ 4 for target in self.plus_target]
        self.plus_source = [self.plus_target.index(state) for state in range(8)]
        self.minus_source = [self.minus_target.index(state) for state in range(8)]
        self.lowest = self.number("lanes/lane_rules.hpp", "lowest")
        self.highest = self.number("lanes/lane_rules.hpp", "highest")
        self.other_state = self.number("lanes/lane_boundaries.hpp", "otherState")
        self.boundary_mask = self.number("fixed/wrap16.hpp", "boundaryMask")
        self.normalised_rows = self.number("lanes/lane_loops.hpp", "normalisedRows")
        self.unbounded_rows = self.number("lanes/lane_loops.hpp", "unboundedRows")
        self.steps_at_once = self.number("lanes/lane_alone.hpp", "stepsAtOnce")
        self.tail_steps = self.tail_sums()

    def find(self, name, pattern):
        found = re.search(pattern, (self.root / "src" / name).read_text(encoding="utf-8"))
        if not found:
            raise SystemExit(f"src/{name} has no {pattern}")
        return found[1]

    def number(self, name, constant):
        text = self.find(name, rf"constexpr [\w:]+ {constant} = ([-+*/ 0-9]+);")
        return eval(text.replace("/", "//"), {"__builtins__": {}})  # only digits and signs get here

    def tail_sums(self):
        """The three branches from each state to state 0, as the signs of the systematic and the parity value."""
        paths = []
        for state in range(8):
            signs = []
            for _ in range(3):
                sign = 1 if self.plus_target[state] < 4 else -1  # a termination shifts a 0 in
                same = state // 2 in (0, 3)
                signs.append((sign, sign if same else -sign))
                state = (self.plus_target if sign > 0 else self.minus_target)[state]
            paths.append(signs)
        return paths
