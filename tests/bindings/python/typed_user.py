# SPDX-License-Identifier: MIT
"""A program that a strict type checker reads; it is not run. The comments of mypy mark what it must refuse."""

from __future__ import annotations

from typing import Optional

import numpy as np
from numpy.typing import NDArray

import quarzel

units: quarzel.Units = 8
algorithm: quarzel.Algorithm = "max-star"
decoder = quarzel.Decoder(units, algorithm, tag_width=4)
quarzel.Decoder(3)  # type: ignore[arg-type]
quarzel.Decoder(algorithm="log-map")  # type: ignore[arg-type]
quarzel.Decoder(algorithm=3)  # type: ignore[arg-type]
decoder.units = 4  # type: ignore[misc]

soft: NDArray[np.int8] = quarzel.quantise([0.5, -1.25], scale=8)
bits: NDArray[np.uint8] = decoder.decode(soft)
only_bits: NDArray[np.uint8] = decoder.decode(soft, tags=[1])  # type: ignore[assignment]
tagged, tags = decoder.decode(soft, tags=[1])
again: quarzel.Decoder = quarzel.Decoder(algorithm=quarzel.algorithms[0], units=decoder.units)

trace: quarzel.BlockTrace = decoder.trace(soft)
number: int = quarzel.read_trace("model.txt")[0].block
starts: NDArray[np.int32] = quarzel.segments(1024, units=2).alpha

scoreboard = quarzel.Scoreboard(decoder, by_tag=True)
scoreboard.expect(soft, tag=3)
try:
    right: bool = scoreboard.check("01", tag=3)
except quarzel.Mismatch as mismatch:
    which: Optional[int] = mismatch.block
    trace = mismatch.trace()


def told(curve: quarzel.Curve, point: quarzel.Point) -> None:
    print(curve.algorithm, point.ber)


for name in quarzel.algorithms:
    result = quarzel.sweep([0.4, 0.8], units=[2, 8], algorithm=name, on_point=told)
    rates: NDArray[np.float64] = result.curves[0].ber
    result.plot(rate="wer")  # type: ignore[arg-type]

scheme: quarzel.lte.Scheme = "64qam"
blocks, filler = quarzel.lte.segment([0, 1, 1])
streams: NDArray[np.uint8] = quarzel.lte.turbo_encode(blocks[0], filler)
buffer = np.zeros(quarzel.lte.whole_buffer_size(40), np.int16)
recovered: NDArray[np.int8] = quarzel.lte.rate_recover(soft, 40, rv=2, buffer=buffer)
quarzel.lte.rate_match(streams, 96, rv=4)  # type: ignore[arg-type]
ratios: NDArray[np.float64] = quarzel.lte.demodulate(quarzel.lte.modulate([0] * 6, scheme), scheme, 0.1, "exact")
quarzel.lte.demodulate([1j], "8psk", 0.1)  # type: ignore[arg-type]
decided, ok, buffers = quarzel.lte.decode_transport_block(soft, 40)
decided, ok, buffers = quarzel.lte.decode_transport_block(soft, 40, rv=2, buffers=buffers)
