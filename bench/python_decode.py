# SPDX-License-Identifier: MIT
"""Python's batch decode beside the C batch call: python_decode.py LIBRARY [BLOCKS [K]]

LIBRARY is the shared library, whose batch call takes ready-made ints; the package is found on PYTHONPATH. Both
decode the same noisy blocks with 2 units, algorithm type 1 and 6 iterations, in turns; the best time of each
counts.
"""

import ctypes
import sys
import time

import numpy as np

import quarzel

ITERATIONS = 6
ROUNDS = 7


class Inputs(ctypes.Structure):
    _fields_ = [(name, ctypes.c_void_p) for name in ("rsc1_sys", "rsc1_par", "rsc2_par")] + [
        ("din_size", ctypes.c_int),
        ("iterations", ctypes.c_int),
        ("tag", ctypes.c_uint),
    ]


class Outputs(ctypes.Structure):
    _fields_ = [
        ("dout", ctypes.c_void_p),
        ("dout_alloc_size", ctypes.c_int),
        ("dout_size", ctypes.c_int),
        ("tag", ctypes.c_uint),
    ]


class Generics(ctypes.Structure):
    _fields_ = [("room", ctypes.c_byte * 72)]


class CModel:
    """The C batch call on ints, with everything made ready before the clock runs."""

    def __init__(self, path, soft):
        self.library = ctypes.CDLL(path)
        self.library.vardel_ip_quarzel_create_state.argtypes = [Generics]
        self.library.vardel_ip_quarzel_create_state.restype = ctypes.c_void_p
        generics = Generics()
        self.library.vardel_ip_quarzel_get_default_generics(ctypes.byref(generics))
        self.state = ctypes.c_void_p(self.library.vardel_ip_quarzel_create_state(generics))
        blocks, _, positions = soft.shape
        self.ints = soft.astype(np.int32)
        self.bits = np.zeros((blocks, positions - 4), dtype=np.uint8)
        self.inputs = (Inputs * blocks)()
        self.outputs = (Outputs * blocks)()
        for block in range(blocks):
            streams = (self.ints[block, stream].ctypes.data for stream in range(3))
            self.inputs[block] = Inputs(*streams, positions, ITERATIONS, 0)
            self.outputs[block] = Outputs(self.bits[block].ctypes.data, positions - 4, 0, 0)

    def decode(self):
        status = self.library.vardel_ip_quarzel_bitacc_simulate_batch(
            self.state, self.outputs, self.inputs, len(self.inputs), None
        )
        if status != 0:
            sys.exit(f"the C interface returned {status}")
        return self.bits


def seconds(call):
    start = time.perf_counter()
    call()
    return time.perf_counter() - start


def main():
    blocks = int(sys.argv[2]) if len(sys.argv) > 2 else 1000
    K = int(sys.argv[3]) if len(sys.argv) > 3 else 1024
    noise = np.random.default_rng(1).normal(-8, 8, (blocks, 3, K + 4))
    soft = np.clip(np.rint(noise), -128, 127).astype(np.int8)
    decoder = quarzel.Decoder()
    c_model = CModel(sys.argv[1], soft)
    if not np.array_equal(decoder.decode(soft, iterations=ITERATIONS), c_model.decode()):
        sys.exit("Python and C decide differently")
    times = [(seconds(lambda: decoder.decode(soft)), seconds(c_model.decode)) for _ in range(ROUNDS)]
    python, c = (min(column) for column in zip(*times))
    megabits = blocks * K * 1e-6
    print(f"{blocks} blocks of K = {K}, {ITERATIONS} iterations, best of {ROUNDS}")
    print(f"C batch call  {megabits / c:8.1f} Mbit/s")
    print(f"Python        {megabits / python:8.1f} Mbit/s  {100 * c / python:.1f} % of C")


if __name__ == "__main__":
    main()
