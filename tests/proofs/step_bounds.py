# SPDX-License-Identifier: MIT
"""What a step, a boundary and a start do to the metrics."""
import z3

from lane_model import GRANULE, Model, differences, over
from prover import Prover

HALF = 1 << 15
BRANCH = 2048
SPREAD = 12288
TAIL = 20480


def word(name):
    return z3.BitVec(name, 16)


def modulo_max(x, y):
    return z3.If(x - y < 0, y, x)


class StepBounds(Prover):
    """The lemmas about one recursion."""

    def steps(self):
        for forward, name in ((True, "forward"), (False, "backward")):
            def change(of, sign, forward=forward):
                def violation(model, bound):
                    metrics = model.anything()
                    after = model.step(forward, metrics)
                    return sign * (of(model, after) - of(model, metrics)) > bound // GRANULE
                return violation

            def spread(model, bound, forward=forward):
                return over(differences(model.steps(forward, model.anything(), 3)), bound)

            def grown(model, bound, forward=forward):
                metrics = model.near_spread(SPREAD)
                return over(differences(model.step(forward, metrics)), SPREAD + bound)

            def shifted(model, bound, forward=forward):
                metrics, branch = model.anything(), model.branch_metrics()
                offset = model.integer()
                after = model.step(forward, metrics, branch)
                moved = model.step(forward, [metric + offset for metric in metrics], branch)
                return z3.Or([x + offset - y > bound // GRANULE for x, y in zip(after, moved)])

            def followed(model, bound, forward=forward):
                metrics, branch = model.anything(), model.branch_metrics()
                lost = [model.integer(0, 127) for _ in range(8)]
                after = model.step(forward, metrics, branch)
                lower = model.step(forward, [m - x for m, x in zip(metrics, lost)], branch)
                return over([x - y for x, y in zip(after, lower)], bound)

            self.prove(f"spread, {name}", spread, SPREAD)
            self.prove(f"largest rises, {name}", change(Model.largest, 1), BRANCH)
            self.prove(f"largest never falls, {name}", change(Model.largest, -1), 0)
            self.prove(f"smallest never falls, {name}", change(Model.smallest, -1), 0)
            self.prove(f"spread grows, {name}", grown, BRANCH)
            self.prove(f"offset passes, {name}", shifted, 0)
            self.prove(f"cleared bits fade, {name}", followed, 127 // GRANULE * GRANULE)

    def words(self):
        def choice(_, bound):
            x, y = z3.Ints("x y")
            wrapped = (x - y + HALF) % (2 * HALF) - HALF
            return z3.And(x >= -HALF, x < HALF, y >= -HALF, y < HALF, x - y <= bound, y - x <= bound,
                          z3.If(wrapped < 0, y, x) != z3.If(x > y, x, y))

        def cancels(_, unequal):
            x, y, c = word("x"), word("y"), word("c")
            d = c + unequal
            return z3.Or(modulo_max(x + c, y + d) != modulo_max(x, y) + c, (x + c) - (y + d) != x - y)

        def unlike(_, multiple):
            x, c = word("x"), word("c")
            mask = z3.BitVecVal(self.sources.boundary_mask, 16)
            return z3.And(c & (multiple - 1) == 0, (x + c) & mask != (x & mask) + c)

        self.prove("plain and modulo maximum", choice, HALF - 1, HALF)
        self.prove("normalisation commutes with clearing", unlike, -self.sources.boundary_mask,
                   -self.sources.boundary_mask // 2)
        self.prove("normalisation cancels", cancels, 0, GRANULE)

    def starts(self):
        def cleared(model, bound):
            metrics = model.near_spread(SPREAD)
            top = model.integer(0, 4096)
            return over(differences([model.cleared(metric + top) for metric in metrics]), bound)

        def tail(model, bound):
            return over(differences(model.tail()), bound)

        def tail_sum(model, bound):
            return over(model.tail(), bound)

        def tail_cleared(model, bound):
            return over([-metric for metric in model.tail_start()], bound)

        self.prove("spread of a boundary", cleared, SPREAD)
        self.prove("spread of a tail", tail, TAIL)
        self.prove("spread of a cleared tail", tail_cleared, TAIL, TAIL - 128)
        self.prove("sums of a tail", tail_sum, 6 * BRANCH)

    def recursions(self):
        """The recursions compare no candidates 2^15 apart: what a start may grow to in two steps is the worst."""
        def apart(model, bound):
            metrics = model.near_spread(TAIL + 2 * BRANCH)
            pairs = model.candidates(False, metrics, model.branch_metrics())
            return over([d for plus, minus in pairs for d in (plus - minus, minus - plus)], bound)

        largest = TAIL + 4 * BRANCH
        self.prove("candidates of a recursion", apart, largest)
        self.require("starts of a recursion", -self.sources.other_state <= TAIL and largest < HALF,
                            f"the known start spreads {-self.sources.other_state}, candidates differ by {largest}")
