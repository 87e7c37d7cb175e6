# SPDX-License-Identifier: MIT
"""What the ratio compares, and where it needs the modulo maximum."""
import z3

from lane_model import GRANULE, differences, over
from prover import Prover
from step_bounds import BRANCH, HALF, SPREAD


class RatioBounds(Prover):
    """The ratio between bounded spreads, and next to the two starts that are wider apart."""

    def ratios(self):
        """No two winners that a tree of the ratio compares are 2^15 apart, and no path leaves 16 bits."""
        s = self.sources
        between = s.highest - s.lowest  # what the branch metrics of two pairs may differ by

        def bounded(model, bound):
            before, after = (model.near_spread(SPREAD) for _ in range(2))
            return z3.Or([over(differences(tree), bound) for tree in model.paths(before, after)])

        def bounded_smallest(model, bound):
            before, after = (model.near_spread(SPREAD) for _ in range(2))
            return over([-path for tree in model.paths(before, after) for path in tree], bound)

        self.prove("ratio, differences", bounded, 2 * SPREAD + between)
        self.prove("ratio, smallest path", bounded_smallest, 2 * SPREAD + BRANCH)
        largest = 127 + (s.normalised_rows - 1) * BRANCH
        fades = 2 * (127 // GRANULE * GRANULE)  # of boundaries that both recursions start from
        bottom = -2 * SPREAD - BRANCH - fades
        top = 2 * largest + BRANCH
        apart = 2 * SPREAD + between + fades
        self.require("ratio, inside 16 bits", -HALF <= bottom and top < HALF and apart < HALF and
                     s.steps_at_once == s.normalised_rows,
                     f"paths in [{bottom}, {top}], differences up to {apart}")

    def known_start(self):
        """The rows nearest to the start of a block, while the backward recursion comes from any start far away."""
        for rows in range(3):
            def apart(model, bound, rows=rows):
                before = model.steps(True, model.known_start(), rows)
                after = model.steps(False, model.anything(), 3)
                return over([d for tree in model.paths(before, after) for x, y in model.compared(tree)
                             for d in (x - y, y - x)], bound)

            self.prove(f"known start, ratio of row {rows}", apart, HALF - GRANULE, 3 * HALF // 4)
        smallest = self.sources.other_state - SPREAD - BRANCH
        self.require("known start, inside 16 bits", smallest >= -HALF, f"the smallest path is {smallest}")

    def tail(self):
        """The rows nearest to a tail, while the forward recursion has its bounded spread. From `unboundedRows` on the
        plain maximum is right, and in the row before a path leaves 16 bits."""
        s = self.sources
        between = s.highest - s.lowest

        def paths(model, rows):
            after = model.steps(False, model.tail_start(), rows)
            before = model.steps(True, model.anything(), 3)
            top = model.largest(before)
            return over([top - path for tree in model.paths(before, after) for path in tree], HALF)

        def smallest(model, rows):
            return over([-metric for metric in model.steps(False, model.tail_start(), rows)],
                        HALF - BRANCH - SPREAD)

        self.prove("tail, rows with the modulo maximum", smallest, s.unbounded_rows, s.unbounded_rows - 1)
        self.prove("tail, a path that leaves 16 bits", paths, s.unbounded_rows, s.unbounded_rows - 1)
        for rows in range(s.unbounded_rows, 3):
            def apart(model, reach, rows=rows):
                metrics = model.steps(False, model.tail_start(), rows)
                pairs = [[metrics[s.plus_target[2 * k + i]] for i in range(2)] for k in range(4)]
                best = [model.named(model.larger(*pair)) for pair in pairs]
                fours = [model.larger(*best[:2]), model.larger(*best[2:])]
                near = HALF - GRANULE - reach
                return z3.Or(over([d for pair in pairs for d in differences(pair)], near),
                             over([d for pair in (best[:2], best[2:], fours) for d in differences(pair)],
                                  near - between))

            self.prove(f"tail, ratio of row {rows}", apart, SPREAD, 2 * SPREAD)
