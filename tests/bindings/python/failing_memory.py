# SPDX-License-Identifier: MIT
"""Let each allocation inside the extensions fail, by itself and with all that follow it; test_failing_memory.py starts
this with calls that can fail. Prints how many failures each kind of call met."""

import itertools
import os
import sys
from pathlib import Path

import numpy as np

import quarzel
from quarzel import lte

rng = np.random.default_rng(20261122)
soft = rng.integers(-40, 41, (3, 3, 44), dtype=np.int8)
bits = rng.integers(0, 2, 100, dtype=np.uint8)
received = np.where(lte.encode_transport_block(bits, 480), 8, -8).astype(np.int8)
kept = quarzel.Decoder(algorithm="max-star")

calls = {
    "Decoder": lambda: quarzel.Decoder(8, "max-star").decode(soft, iterations=2),
    "decode": lambda: kept.decode(soft, iterations=2),
    "decode_every_iteration": lambda: kept.decode_every_iteration(soft, iterations=2),
    "trace": lambda: kept.trace(soft[0], iterations=1).bits,
    "encode": lambda: quarzel.encode(bits[:40]),
    "quantise": lambda: quarzel.quantise(soft * 0.3),
    "encode_transport_block": lambda: lte.encode_transport_block(bits, 480),
    "decode_transport_block": lambda: lte.decode_transport_block(received, 100)[0],
}


def same(result, expected):
    return np.array_equal(np.asarray(result), np.asarray(expected))


mark = Path(os.environ["QUARZEL_FAILED"])
for name, call in calls.items():
    expected = call()
    failures = 0
    for more in ("", "+"):
        for number in itertools.count(1):
            os.environ["QUARZEL_FAILING"] = f"malloc {number}{more}"
            try:
                result = call()
            except MemoryError:
                result = None
            finally:
                del os.environ["QUARZEL_FAILING"]
            if not mark.exists():
                break
            mark.unlink()
            failures += 1
            if not (result is None or same(result, expected)) or not same(call(), expected):
                sys.exit(f"{name}: allocation {number}{more} spoils the result")
    print(name, failures)
