# SPDX-License-Identifier: MIT
"""Where values clip, for docs/quantiser.md: clipping.py [--blocks N]

Decodes blocks with traces and counts the values at the ends of their ranges, as CSV. A branch metric counts once a step.
"""

import argparse

import numpy as np

import quarzel

options = argparse.ArgumentParser(description="Share of values that clip, by type and factor, as CSV")
options.add_argument("--blocks", type=int, default=100, help="blocks for each line (default 100)")
blocks = options.parse_args().blocks

K = 1024
UNITS = 2
ITERATIONS = 8
EBN0_DB = (1.5, 1.2, 1.15)  # of types 0, 1, 2: where about one block in 10,000 fails
LOWEST, HIGHEST = -128, 127


def at_the_ends(values):
    """Of an array, which values are where clipping puts them."""
    return (values <= LOWEST) | (values >= HIGHEST)


print("block_size,algorithm,ebn0_db,factor,blocks,inputs,branch_metrics,extrinsics")
for algorithm, ebn0_db in enumerate(EBN0_DB):
    rng = np.random.default_rng(1)
    bits = rng.integers(0, 2, (blocks, K), dtype=np.uint8)
    variance = 1.5 / 10 ** (ebn0_db / 10)
    symbols = 2.0 * quarzel.encode(bits) - 1.0
    ratios = 2 / variance * (symbols + rng.normal(0, np.sqrt(variance), symbols.shape))
    for factor in (1, 2, 3, 4, 6, 8, 12, 16):
        soft = quarzel.quantise(ratios, factor)
        steps = branch_metrics = extrinsics = 0
        with quarzel.Decoder(UNITS, algorithm) as decoder:
            for block in soft:
                for one in decoder.trace(block, iterations=ITERATIONS).passes:
                    steps += K
                    branch_metrics += at_the_ends(one["g"][:K]).any(axis=1).sum()
                    extrinsics += at_the_ends(one["ext"][:K]).sum()
        print(f"{K},{algorithm},{ebn0_db},{factor},{blocks},{at_the_ends(soft).mean():.5f},"
              f"{branch_metrics / steps:.5f},{extrinsics / steps:.5f}")
