# SPDX-License-Identifier: MIT
"""Links over Eb/N0: random bits, encoder, channel, quantiser, core, counting."""

from __future__ import annotations

import json
import os
from typing import Callable, Iterable, Literal, Optional, Union

import numpy as np
from numpy.typing import ArrayLike

from . import _core
from ._checks import array_of, choice, real, whole
from ._curve import Curve, Point, curve_of, point_of
from ._decoder import algorithm_number
from ._link import link_configuration, listed
from ._optional import sweep_extension
from ._result import SweepResult
from ._types import AlgorithmOrNumber, Units

_MAX_COUNT = 2**64 - 1
_MAX_THREADS = 1024


def sweep(
    ebn0_db: ArrayLike,
    *,
    block_size: Union[int, Iterable[int], None] = None,
    units: Union[Units, Iterable[Units]] = 2,
    algorithm: Union[AlgorithmOrNumber, Iterable[AlgorithmOrNumber]] = "scaled-max-log",
    iterations: Union[int, Iterable[int]] = 6,
    llr: Union[float, Iterable[float], None] = None,
    scale: Union[float, Iterable[float], None] = None,
    transport_block: Union[int, Iterable[int], None] = None,
    coded_bits: Union[int, Iterable[int], None] = None,
    code_rate: Union[float, Iterable[float], None] = None,
    modulation: Union[str, Iterable[str]] = "bpsk",
    channel: Union[str, Iterable[str]] = "awgn",
    demapping: Union[str, Iterable[str]] = "maxlog",
    rv: Union[int, Iterable[int], None] = None,
    harq: Optional[int] = None,
    stop: Literal["none", "crc"] = "none",
    seed: int = 1,
    max_blocks: int = 10000,
    max_block_errors: int = 100,
    max_seconds: int = 0,
    per_iteration: bool = False,
    threads: Optional[int] = None,
    on_point: Optional[Callable[[Curve, Point], None]] = None,
) -> SweepResult:
    """Simulate a link over Eb/N0. The same arguments give the same result, whatever the threads and the machine.

    :param ebn0_db: Eb/N0 of an information bit, one or many, in dB; the rate is taken as 1/3 unless blocks are coded
    :param block_size: K, one or many; 1024 when not given; likewise ``units``, ``algorithm`` and ``iterations``: every
        combination gives a curve
    :param llr: units for a log-likelihood ratio of 1, one or many; 4 when neither this nor ``scale`` is given
    :param scale: units for the amplitude 1 that is sent, one or many, instead of ``llr``
    :param transport_block: A, one or many: transport blocks with CRCs, cut into code blocks, instead of ``block_size``
    :param coded_bits: of a transmission, one or many; each code bit is sent once when neither this nor ``code_rate``
        is given
    :param code_rate: the same as information bits for each coded bit, taken to whole symbols
    :param modulation: ``"bpsk"``, ``"qpsk"``, ``"16qam"``, ``"64qam"`` or ``"256qam"``, one or many
    :param channel: ``"awgn"``, ``"rayleigh"`` (each symbol fades by itself) or ``"rayleigh-block"`` (each transmission
        does), one or many
    :param demapping: ``"maxlog"`` or ``"exact"`` log-likelihood ratios of symbols, one or many
    :param rv: redundancy version of each transmission, in turn; 0, with ``harq`` 0, 2, 3, 1 when not given
    :param harq: send a block up to so many times until it is right, soft values added up
    :param stop: ``"crc"``: the receiver ends the iterations of a transport block when its CRCs hold
    :param max_blocks: a point ends after so many blocks,
    :param max_block_errors: or with this block error (0: however many there are),
    :param max_seconds: or after this time (0: however long it takes); the result then depends on the clock
    :param per_iteration: count errors after every iteration
    :param threads: as many as the process may use when not given
    :param on_point: called with a curve (without points) and a point of it when that has ended, in order; what
        it raises ends the sweep
    :raises ValueError: the sweep is not possible; the text says why
    :raises ImportError: this build or this machine lacks what sweeps need; the text says what

    >>> (curve,) = quarzel.sweep([0.0, 6.0], block_size=40, max_blocks=50).curves
    >>> bool(curve.ber[1] < curve.ber[0])
    True
    >>> (curve,) = quarzel.sweep(6.0, block_size=40, code_rate=0.75, modulation="16qam", max_blocks=50).curves
    >>> curve.coded_bits
    52
    """
    if llr is not None and scale is not None:
        raise ValueError("llr and scale are two quantisers; give one of them")
    kind = "llr" if scale is None else "scale"
    units_of_one = scale if scale is not None else llr if llr is not None else _core.llr_scale
    count = len(os.sched_getaffinity(0)) if threads is None else whole("threads", threads, 1, _MAX_THREADS)
    configuration = {
        "seed": whole("seed", seed, 0, _MAX_COUNT),
        "max_blocks": whole("max_blocks", max_blocks, 0, _MAX_COUNT),
        "max_block_errors": whole("max_block_errors", max_block_errors, 0, _MAX_COUNT),
        "max_seconds": whole("max_seconds", max_seconds, 0, _MAX_COUNT),
        "per_iteration": bool(per_iteration),
        "quantiser": kind,
        "scale": [real(kind, value) for value in listed(units_of_one)],
        "units": [choice("units", value, (2, 4, 8)) for value in listed(units)],
        "algorithm": [algorithm_number(value) for value in listed(algorithm)],
        "iterations": [whole("iterations", value, 1, 15) for value in listed(iterations)],
        "ebn0_db": _decibels(ebn0_db),
        **link_configuration(
            block_size=block_size, transport_block=transport_block, coded_bits=coded_bits, code_rate=code_rate,
            modulation=modulation, channel=channel, demapping=demapping, rv=rv, harq=harq, stop=stop,
        ),  # fmt: skip
    }

    def tell(text: str) -> None:
        assert on_point is not None
        head = json.loads(text)
        (point,) = head["points"]
        on_point(curve_of({**head, "points": []}), point_of(point))

    return SweepResult(sweep_extension().run(json.dumps(configuration), count, tell if on_point else None))


def _decibels(ebn0_db: ArrayLike) -> list[float]:
    array = array_of("ebn0_db", ebn0_db)
    if array.size and array.dtype.kind not in "fiu":
        raise TypeError(f"ebn0_db must hold real numbers in dB, not {array.dtype}")
    if array.size and not np.isfinite(array).all():
        raise ValueError("every Eb/N0 must be finite")
    return [round(float(value), 6) for value in array.reshape(-1)]
