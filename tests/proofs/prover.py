# SPDX-License-Identifier: MIT
"""Proves lemmas over the model, each with a bound at which it must fail."""
import time

from lane_model import GRANULE, Model


class Prover:
    """Proves lemmas and counts those that fail."""

    def __init__(self, sources, limit):
        """@param limit  seconds that the solver may take for one question"""
        self.sources = sources
        self.limit = limit
        self.failures = 0

    def violated(self, violation, bound):
        """Whether the solver finds values that break a lemma at this bound; None when it cannot tell."""
        model = Model(self.sources)
        model.solver.add(violation(model, bound))
        model.solver.set("timeout", 1000 * self.limit)
        return {"sat": True, "unsat": False}.get(str(model.solver.check()))

    def prove(self, name, violation, bound, broken=None):
        """@param violation  gives, of a model and a bound, the term that says that values break the lemma
        @param broken  a bound at which they do, which shows that the proof can fail: the next one when None
        """
        broken = bound - GRANULE if broken is None else broken
        start = time.monotonic()
        held, fell = self.violated(violation, bound), self.violated(violation, broken)
        seconds = time.monotonic() - start
        if held is False and fell:
            print(f"{name}: proved at {bound}, refuted at {broken}, {seconds:.1f} s", flush=True)
            return
        self.failures += 1
        words = {True: "refuted", False: "proved", None: "not decided"}
        print(f"{name}: NOT shown: {words[held]} at {bound}, {words[fell]} at {broken}, {seconds:.1f} s", flush=True)

    def require(self, name, holds, text):
        """What only compares numbers of the sources with what was proved."""
        print(f"{name}: {text}" if holds else f"{name}: does NOT hold: {text}", flush=True)
        self.failures += not holds
