# SPDX-License-Identifier: MIT
"""What does a retransmission buy? A notebook as a script: python_throughput.py [--blocks N] [--picture FILE]

The parts between the lines of "# %%" are cells for editors that know them.
"""

# %% Needs NumPy and quarzel; Matplotlib for the picture
import argparse

import numpy as np

import quarzel
from quarzel import lte

options = argparse.ArgumentParser(description="Throughput over SNR for three modulation and coding schemes with HARQ")
options.add_argument("--blocks", type=int, default=200, help="transport blocks a point (default 200)")
options.add_argument("--picture", help="file for the picture, .svg or .png")
chosen = options.parse_args()

SYMBOLS = 3000  # of a transmission
# The modulation, the coded bits of a transmission and those of a transport block
SCHEMES = {
    "QPSK 1/3": ("qpsk", 2 * SYMBOLS, 2000),
    "16QAM 1/2": ("16qam", 4 * SYMBOLS, 6000),
    "64QAM 3/4": ("64qam", 6 * SYMBOLS, 13500),
}
REDUNDANCY_VERSIONS = (0, 2, 3, 1)
SNR_DB = np.arange(-8.0, 19.0)
rng = np.random.default_rng(7)


# %% A transmission over white Gaussian noise: Es/N0, for symbols of mean energy 1
def received(bits, scheme, G, rv, snr_db):
    symbols = lte.modulate(lte.encode_transport_block(bits, G, scheme, rv=rv), scheme)
    variance = 10 ** (-snr_db / 10)
    noise = rng.normal(0, np.sqrt(variance / 2), (2, *symbols.shape))
    return quarzel.quantise(lte.demodulate(symbols + noise[0] + 1j * noise[1], scheme, variance))


# %% Each transport block is sent until it is right, four times at the most
throughput = np.zeros((len(SCHEMES), len(SNR_DB)))
first_alone = np.zeros_like(throughput)
for row, (scheme, G, A) in enumerate(SCHEMES.values()):
    for point, snr_db in enumerate(SNR_DB):
        bits = rng.integers(0, 2, (chosen.blocks, A), dtype=np.uint8)
        buffers, delivered, transmissions = None, 0, 0
        for rv in REDUNDANCY_VERSIONS:
            soft = received(bits, scheme, G, rv, snr_db)
            _, ok, buffers = lte.decode_transport_block(soft, A, scheme, rv=rv, buffers=buffers)
            transmissions += len(bits)
            delivered += np.count_nonzero(ok)
            if rv == 0:
                first_alone[row, point] = delivered * A / (transmissions * SYMBOLS)
            bits, buffers = bits[~ok], buffers[~ok]
            if not len(bits):
                break
        throughput[row, point] = delivered * A / (transmissions * SYMBOLS)

print("SNR dB", *(f"{name:>10}" for name in SCHEMES), " bits a symbol")
for point, snr_db in enumerate(SNR_DB):
    print(f"{snr_db:6.1f}", *(f"{value:10.3f}" for value in throughput[:, point]))

# %% The picture
if chosen.picture:
    import matplotlib

    matplotlib.use("Agg")
    import matplotlib.pyplot as plt

    figure, axes = plt.subplots(figsize=(7, 5), layout="constrained")
    for name, values, alone in zip(SCHEMES, throughput, first_alone):
        (line,) = axes.plot(SNR_DB, values, "o-", markersize=4, label=name)
        axes.plot(SNR_DB, alone, "--", color=line.get_color(), linewidth=1)
    axes.plot([], [], "--", color="grey", linewidth=1, label="one transmission only")
    axes.set(xlabel="Es/N0 [dB]", ylabel="bits a symbol", title="Up to four transmissions, scaled max-log, 8 units")
    axes.grid(True, alpha=0.3)
    axes.legend()
    figure.savefig(chosen.picture, metadata={"Date": None} if chosen.picture.endswith(".svg") else None)
