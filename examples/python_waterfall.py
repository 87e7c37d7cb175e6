# SPDX-License-Identifier: MIT
"""How many iterations are worth their time? A notebook as a script: python_waterfall.py [--blocks N] [--picture FILE]

The parts between the lines of "# %%" are cells for editors that know them.
"""

# %% Needs NumPy and quarzel; Matplotlib for the picture
import argparse

import numpy as np

import quarzel

options = argparse.ArgumentParser(description="Bit error rate over Eb/N0 after 1 to 8 iterations")
options.add_argument("--blocks", type=int, default=2000, help="blocks a point (default 2000)")
options.add_argument("--picture", help="file for the picture, .svg or .png")
chosen = options.parse_args()

K = 1024
EBN0_DB = np.arange(0.0, 1.01, 0.1)
ITERATIONS = (1, 2, 3, 4, 6, 8)
rng = np.random.default_rng(7)

# %% The sent bits, and the code bits as BPSK symbols: bit 1 is +1
bits = rng.integers(0, 2, (chosen.blocks, K), dtype=np.uint8)
symbols = 2.0 * quarzel.encode(bits) - 1.0


# %% The channel, and the quantiser of log-likelihood ratios
def received(ebn0_db):
    variance = 1 / (2 * (1 / 3) * 10 ** (ebn0_db / 10))
    noisy = symbols + rng.normal(0, np.sqrt(variance), symbols.shape)
    return quarzel.quantise(2 * noisy / variance)


# %% Decode the same noise with each number of iterations
error_rate = np.zeros((len(ITERATIONS), len(EBN0_DB)))
with quarzel.Decoder(units=2, algorithm="scaled-max-log") as decoder:
    for point, ebn0_db in enumerate(EBN0_DB):
        soft = received(ebn0_db)
        for row, iterations in enumerate(ITERATIONS):
            error_rate[row, point] = np.mean(decoder.decode(soft, iterations=iterations) != bits)

print("Eb/N0", *(f"{iterations:>8} it" for iterations in ITERATIONS))
for point, ebn0_db in enumerate(EBN0_DB):
    print(f"{ebn0_db:5.1f}", *(f"{rate:11.2e}" for rate in error_rate[:, point]))

# %% The picture; a rate of 0 has no place on a logarithmic axis, and the curve ends there
if chosen.picture:
    import matplotlib

    matplotlib.use("Agg")
    import matplotlib.pyplot as plt

    figure, axes = plt.subplots(figsize=(7, 5), layout="constrained")
    for iterations, rates in zip(ITERATIONS, error_rate):
        axes.semilogy(EBN0_DB, np.where(rates > 0, rates, np.nan), "o-", markersize=4, label=f"{iterations}")
    axes.set(xlabel="Eb/N0 [dB]", ylabel="bit error rate", title=f"K = {K}, scaled max-log, 2 units")
    axes.grid(True, which="both", alpha=0.3)
    axes.legend(title="iterations")
    figure.savefig(chosen.picture, metadata={"Date": None} if chosen.picture.endswith(".svg") else None)
