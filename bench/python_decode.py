# SPDX-License-Identifier: MIT
"""Python's batch decode beside the C array call: python_decode.py LIBRARY [BLOCKS [K]]

LIBRARY is the shared library; the package is found on PYTHONPATH. Both decode the same array of noisy int8 blocks
with 2 units, algorithm type 1 and 6 iterations, in turns; the best time of each counts. Then one small block is decoded
in a call of its own, and one is traced.
"""

import ctypes
import sys
import time

import numpy as np

import quarzel

ITERATIONS = 6
ROUNDS = 7
SMALL_K = 40
SHORT_CALLS = 200


class Inputs(ctypes.Structure):
    _fields_ = [(name, ctypes.c_void_p) for name in ("rsc1_sys", "rsc1_par", "rsc2_par")] + [
        ("block_stride", ctypes.c_ssize_t),
        ("position_stride", ctypes.c_ssize_t),
        ("value_type", ctypes.c_int),
        ("din_size", ctypes.c_int),
        ("count", ctypes.c_int),
        ("iterations", ctypes.c_int),
        ("tags", ctypes.c_void_p),
    ]


class Outputs(ctypes.Structure):
    _fields_ = [
        ("dout", ctypes.c_void_p),
        ("block_stride", ctypes.c_ssize_t),
        ("iteration_stride", ctypes.c_ssize_t),
        ("tags", ctypes.c_void_p),
    ]


class Generics(ctypes.Structure):
    _fields_ = [("room", ctypes.c_byte * 72)]


class CModel:
    """The C array call, with everything made ready before the clock runs."""

    def __init__(self, path, soft):
        self.library = ctypes.CDLL(path)
        self.library.vardel_ip_quarzel_create_state.argtypes = [Generics]
        self.library.vardel_ip_quarzel_create_state.restype = ctypes.c_void_p
        generics = Generics()
        self.library.vardel_ip_quarzel_get_default_generics(ctypes.byref(generics))
        self.state = ctypes.c_void_p(self.library.vardel_ip_quarzel_create_state(generics))
        blocks, _, positions = soft.shape
        self.bits = np.zeros((blocks, positions - 4), dtype=np.uint8)
        streams = (soft[:, stream].ctypes.data for stream in range(3))
        self.inputs = Inputs(*streams, 3 * positions, 1, soft.itemsize, positions, blocks, ITERATIONS, None)
        self.outputs = Outputs(self.bits.ctypes.data, positions - 4, 0, None)

    def decode(self):
        status = self.library.vardel_ip_quarzel_bitacc_simulate_array(
            self.state, ctypes.byref(self.outputs), ctypes.byref(self.inputs), None
        )
        if status != 0:
            sys.exit(f"the C interface returned {status}")
        return self.bits


def seconds(call):
    start = time.perf_counter()
    call()
    return time.perf_counter() - start


def many_seconds(call):
    """The time of a short call, from many."""
    return min(seconds(lambda: [call() for _ in range(SHORT_CALLS)]) for _ in range(ROUNDS)) / SHORT_CALLS


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
    print(f"C array call  {megabits / c:8.1f} Mbit/s")
    print(f"Python        {megabits / python:8.1f} Mbit/s  {100 * c / python:.1f} % of C")
    single = np.ascontiguousarray(soft[:1, :, :SMALL_K + 4])
    one_c = CModel(sys.argv[1], single)
    one = [(many_seconds(lambda: decoder.decode(single[0])), many_seconds(one_c.decode)) for _ in range(ROUNDS)]
    python, c = (1e6 * min(column) for column in zip(*one))
    print(f"One block     {python:8.2f} us for K = {SMALL_K} in a call, {c:.2f} us in C by ctypes")
    trace = min(seconds(lambda: decoder.trace(soft[0], iterations=ITERATIONS)) for _ in range(ROUNDS))
    print(f"Python trace  {1e3 * trace:8.1f} ms for a block of K = {K}, {2 * ITERATIONS} passes")


if __name__ == "__main__":
    main()
