# SPDX-License-Identifier: MIT
"""3GPP TS 36.212, 5.1.1 to 5.1.5, and TS 36.211, 7.1, written down formula by formula for one block.

Nothing is shared with what is tested. -1 stands for <NULL>.
"""

import csv
import math
from pathlib import Path

import numpy as np

with open(Path(__file__).parents[2] / "data" / "qpp_table.csv") as _table:
    QPP = {int(row["K"]): (int(row["f1"]), int(row["f2"])) for row in csv.DictReader(_table)}
SIZES = sorted(QPP)

POWERS = {
    "crc24a": (24, 23, 18, 17, 14, 11, 10, 7, 6, 5, 4, 3, 1, 0),
    "crc24b": (24, 23, 6, 5, 1, 0),
    "crc16": (16, 12, 5, 0),
    "crc8": (8, 7, 4, 3, 1, 0),
}
COLUMNS = [0, 16, 8, 24, 4, 20, 12, 28, 2, 18, 10, 26, 6, 22, 14, 30,
           1, 17, 9, 25, 5, 21, 13, 29, 3, 19, 11, 27, 7, 23, 15, 31]  # fmt: skip
BITS_OF_SYMBOL = {"bpsk": 1, "qpsk": 2, "16qam": 4, "64qam": 6, "256qam": 8}


def parity(name, bits):
    """The remainder of a long division by the generator."""
    powers = POWERS[name]
    length = powers[0]
    generator = np.array([length - i in powers for i in range(length + 1)], dtype=np.uint8)
    rest = np.concatenate([bits, np.zeros(length, np.uint8)]).astype(np.uint8)
    for i in range(len(bits)):
        if rest[i]:
            rest[i : i + length + 1] ^= generator
    return rest[-length:]


def cut(B):
    """K of each code block, and F."""
    if B <= 6144:
        C, L = 1, 0
    else:
        L = 24
        C = math.ceil(B / (6144 - L))
    total = B + C * L
    plus = min(K for K in SIZES if C * K >= total)
    if C == 1:
        return [plus], plus - total
    minus = max(K for K in SIZES if K < plus)
    count_minus = (C * plus - total) // (plus - minus)
    sizes = [minus] * count_minus + [plus] * (C - count_minus)
    return sizes, sum(sizes) - total


def segments(bits):
    sizes, filler = cut(len(bits))
    L = 24 if len(sizes) > 1 else 0
    blocks = []
    for r, K in enumerate(sizes):
        front = filler if r == 0 else 0
        own, bits = bits[: K - L - front], bits[K - L - front :]
        block = np.concatenate([np.full(front, -1), own.astype(int)])
        if L:
            block = np.concatenate([block, parity("crc24b", np.maximum(block, 0).astype(np.uint8))])
        blocks.append(block)
    assert len(bits) == 0
    return blocks


def constituent(bits):
    """The parity bits of the steps, and systematic and parity bits of the three steps of termination."""
    a = b = c = 0
    z = []
    for bit in bits:
        feedback = bit ^ b ^ c
        z.append(feedback ^ a ^ c)
        a, b, c = feedback, a, b
    x_tail, z_tail = [], []
    for _ in range(3):
        x_tail.append(b ^ c)
        z_tail.append(a ^ c)
        a, b, c = 0, a, b
    return z, x_tail, z_tail


def turbo(block):
    """(3, K + 4) of a block, in which -1 stands for filler."""
    K = len(block)
    f1, f2 = QPP[K]
    bits = [max(int(bit), 0) for bit in block]
    order = [(f1 * i + f2 * i * i) % K for i in range(K)]
    z1, x, z = constituent(bits)
    z2, x_, z_ = constituent([bits[i] for i in order])
    filler = int(np.sum(np.asarray(block) == -1))
    return np.array([
        [-1] * filler + bits[filler:] + [x[0], z[1], x_[0], z_[1]],
        [-1] * filler + z1[filler:] + [z[0], x[2], z_[0], x_[2]],
        z2 + [x[1], z[2], x_[1], z_[2]],
    ])  # fmt: skip


def selection(K, filler, rv, E, Ncb=None):
    """For each coded bit its place in the three streams laid after one another, and in w."""
    D = K + 4
    R = math.ceil(D / 32)
    size = 32 * R
    padded = np.concatenate([np.full(size - D, -1), np.arange(D)])
    v = []
    for stream in range(3):
        if stream < 2:
            v.append(padded.reshape(R, 32)[:, COLUMNS].T.reshape(-1))
        else:
            k = np.arange(size)
            v.append(padded[(np.array(COLUMNS)[k // R] + 32 * (k % R) + 1) % size])
        unsent = (v[stream] < 0) | ((v[stream] < filler) & (stream < 2))
        v[stream] = np.where(unsent, -1, v[stream] + stream * D)
    w = np.concatenate([v[0], np.stack([v[1], v[2]], axis=1).reshape(-1)])
    Ncb = len(w) if Ncb is None else Ncb
    k0 = R * (2 * math.ceil(Ncb / (8 * R)) * rv + 2)
    entries = (k0 + np.arange(Ncb)) % Ncb
    entries = entries[w[entries] >= 0]
    entries = np.resize(entries, E)
    return w[entries], entries


def coded_sizes(C, G, layers, Qm):
    symbols = G // (layers * Qm)
    gamma = symbols % C
    small, large = layers * Qm * (symbols // C), layers * Qm * math.ceil(symbols / C)
    return [small if r <= C - gamma - 1 else large for r in range(C)]


def encode(bits, G, scheme, layers, rv):
    blocks = segments(np.concatenate([bits, parity("crc24a", bits)]))
    coded = []
    for block, E in zip(blocks, coded_sizes(len(blocks), G, layers, BITS_OF_SYMBOL[scheme])):
        places, _ = selection(len(block), int(np.sum(block == -1)), rv, E)
        coded.append(turbo(block).reshape(-1)[places])
    return np.concatenate(coded)


def symbols(scheme):
    """The symbols of all words, the first bit highest: signs and nested distances."""
    Qm = BITS_OF_SYMBOL[scheme]
    words = np.arange(2**Qm)
    sign = [1 - 2 * (words >> (Qm - 1 - i) & 1) for i in range(Qm)]
    if scheme == "bpsk":
        return sign[0] * (1 + 1j) / math.sqrt(2)

    def level(signs):
        return signs[0] * (2 ** (len(signs) - 1) - level(signs[1:])) if len(signs) > 1 else signs[0]

    energy = 2 * (4 ** (Qm // 2) - 1) / 3
    return (level(sign[0::2]) + 1j * level(sign[1::2])) / math.sqrt(energy)
