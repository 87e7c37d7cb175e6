# SPDX-License-Identifier: MIT
"""What tells curves apart, and curves that are one."""

from __future__ import annotations

import dataclasses
from typing import Iterable, Optional, Union

from ._curve import Curve
from ._link import sending_text
from ._result import SweepResult

Results = Union[SweepResult, Curve, Iterable[Union[SweepResult, Curve]]]


def labelled(results: Results, block_sizes: Optional[list[int]]) -> tuple[str, list[tuple[str, Curve]]]:
    """What all curves share, and each curve with what it differs in; those measured alike are joined.

    :param block_sizes: that are wanted; all when None
    :raises ValueError: there is no curve
    """
    joined: list[tuple[tuple[str, ...], Curve]] = []
    for number, result in enumerate([results] if isinstance(results, (SweepResult, Curve)) else results, 1):
        seed, curves = (f"seed {result.seed}", result.curves) if isinstance(result, SweepResult) else ("", [result])
        for curve in curves:
            if block_sizes is not None and curve.information_bits not in block_sizes:
                continue
            key = (*_setup(curve), seed, f"result {number}")
            for index, (other, former) in enumerate(joined):
                if other[:-2] == key[:-2] and _can_join(former, curve, other[-2] == key[-2]):
                    joined[index] = other, _join(former, curve)
                    break
            else:
                joined.append((key, curve))
    if not joined:
        raise ValueError("there is no curve; give the result of a sweep, and block sizes that it has")
    keys = [key for key, _ in joined]
    fields = len(keys[0]) - 2
    differing = [index for index in range(fields) if len({key[index] for key in keys}) > 1]
    title = _listing(keys[0], [index for index in range(fields) if index not in differing])
    for last in (fields, fields + 1):  # the seed and the result, where nothing else tells curves apart
        if len({tuple(key[index] for index in differing) for key in keys}) < len(keys):
            differing.append(last)
    labels = [_listing(key, differing) or "quarzel" for key in keys]
    return title, [(label, curve) for label, (_, curve) in zip(labels, joined)]


def longest(curves: list[Curve]) -> list[Curve]:
    """The curves without those that differ from the longest in their iterations alone, which it contains."""
    first = max(curves, key=lambda curve: curve.iterations)
    other = {"iterations": first.iterations, "points": []}
    same = dataclasses.replace(first, **other)
    return [curve for curve in curves if curve is first or dataclasses.replace(curve, **other) != same]


def _listing(key: tuple[str, ...], fields: list[int]) -> str:
    return ", ".join(key[index] for index in fields if key[index])


def _can_join(a: Curve, b: Curve, have_one_seed: bool) -> bool:
    """Whether curves of one setup are one measurement: not two of the same point."""
    former = {point.ebn0_db: point for point in a.points}
    common = [(former[point.ebn0_db], point) for point in b.points if point.ebn0_db in former]
    return not common or (have_one_seed and all(x.blocks != y.blocks or x.bit_errors == y.bit_errors for x, y in common))


def _join(a: Curve, b: Curve) -> Curve:
    """The points of both; where both have one, that with more blocks."""
    most = {point.ebn0_db: point for point in sorted([*a.points, *b.points], key=lambda point: point.blocks)}
    points = sorted(most.values(), key=lambda point: point.ebn0_db)
    return dataclasses.replace(a, points=points)


def _setup(curve: Curve) -> tuple[str, ...]:
    """What a curve was measured with, in the order in which it is told."""
    return (
        f"{'A' if curve.transport_block else 'K'} = {curve.information_bits}",
        f"{curve.units} units",
        curve.algorithm.replace("scaled-max-log", "scaled max-log"),
        f"{curve.iterations} iteration{'s' * (curve.iterations > 1)}",
        f"{'LLR' if curve.quantiser == 'llr' else 'amplitude'} \u00d7 {curve.scale:g}",
        sending_text(curve),
    )
