# SPDX-License-Identifier: MIT
"""The trellis step over a solver's integers.

Every metric is a multiple of 16: soft values, branch metrics, starts and what a boundary clears all are. The model
counts in these granules, so that a counterexample is one that words can have.
"""
import z3

GRANULE = 16


def over(terms, bound):
    """Some term is larger than the bound, which is in words."""
    return z3.Or([term > bound // GRANULE for term in terms])


def differences(terms):
    return [x - y for x in terms for y in terms if x is not y]


class Model:
    """Metrics and steps in one solver. Every variable is bounded as its values are in the core."""

    def __init__(self, sources):
        self.sources = sources
        self.solver = z3.Solver()
        self.count = 0

    def integer(self, least=None, most=None):
        self.count += 1
        value = z3.Int(f"v{self.count}")
        if least is not None:
            self.solver.add(value >= least // GRANULE, value <= most // GRANULE)
        return value

    def named(self, term):
        """A variable for a term, so that terms stay small."""
        value = self.integer()
        self.solver.add(value == term)
        return value

    def soft_value(self):
        """A soft value or a branch metric: both have the limits of the branch format."""
        return self.integer(self.sources.lowest, self.sources.highest)

    def anything(self):
        return [self.integer() for _ in range(8)]

    def larger(self, x, y):
        return z3.If(x >= y, x, y)

    def largest(self, terms):
        terms = list(terms)
        while len(terms) > 1:
            terms = [self.larger(*terms[i:i + 2]) for i in range(0, len(terms), 2)]
        return self.named(terms[0])

    def smallest(self, terms):
        return -self.largest([-term for term in terms])

    def branch_metrics(self):
        """Of the four pairs of states: with one parity there are two values."""
        same, opposite = self.soft_value(), self.soft_value()
        return [same, opposite, opposite, same]

    def candidates(self, forward, metrics, branch):
        """The + and the - candidate of each state."""
        s = self.sources
        if forward:
            plus, minus = s.plus_source, s.minus_source
            return [(metrics[plus[i]] + branch[plus[i] // 2], metrics[minus[i]] - branch[minus[i] // 2])
                    for i in range(8)]
        return [(metrics[s.plus_target[i]] + branch[i // 2], metrics[s.minus_target[i]] - branch[i // 2])
                for i in range(8)]

    def step(self, forward, metrics, branch=None):
        branch = branch or self.branch_metrics()
        return [self.named(self.larger(*pair)) for pair in self.candidates(forward, metrics, branch)]

    def steps(self, forward, metrics, count):
        for _ in range(count):
            metrics = self.step(forward, metrics)
        return metrics

    def paths(self, before, after):
        """The two trees of the ratio: the paths over the + branches and those over the - branches, state by state."""
        s = self.sources
        branch = self.branch_metrics()
        return ([before[i] + after[s.plus_target[i]] + branch[i // 2] for i in range(8)],
                [before[i] + after[s.minus_target[i]] - branch[i // 2] for i in range(8)])

    def compared(self, paths):
        """The pairs that the maxima of a tree compare."""
        while len(paths) > 1:
            pairs = list(zip(paths[1::2], paths[::2]))
            yield from pairs
            paths = [self.named(self.larger(*pair)) for pair in pairs]

    def cleared(self, term):
        """With the low bits cleared that a boundary does not have."""
        unit = -self.sources.boundary_mask // GRANULE
        multiple, rest = self.integer(), self.integer()
        self.solver.add(term == unit * multiple + rest, rest >= 0, rest < unit)
        return unit * multiple

    def tail(self):
        """The sums of six soft values that a tail gives."""
        values = [(self.soft_value(), self.soft_value()) for _ in range(3)]
        return [self.named(sum(a * x + b * y for (a, b), (x, y) in zip(path, values)))
                for path in self.sources.tail_steps]

    def tail_start(self):
        """A tail as a boundary: cleared, its largest metric at 0."""
        metrics = [self.cleared(metric) for metric in self.tail()]
        top = self.largest(metrics)
        return [self.named(metric - top) for metric in metrics]

    def known_start(self):
        """The start of a block."""
        return [z3.IntVal(0)] + [z3.IntVal(self.sources.other_state // GRANULE)] * 7

    def near_spread(self, spread):
        """Metrics of that spread, their largest at 0."""
        metrics = [self.integer(-spread, 0) for _ in range(8)]
        self.solver.add(self.largest(metrics) == 0)
        return metrics
