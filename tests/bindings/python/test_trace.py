# SPDX-License-Identifier: MIT
"""Traces as arrays and as text."""

import copy
import ctypes
import os
import pickle
import subprocess

import numpy as np
import pytest

import quarzel


@pytest.fixture
def soft(captures):
    return np.load(captures / "k40.soft.npy")


def test_signals_have_their_shapes_and_decide_the_bits(soft):
    decoder = quarzel.Decoder(8)
    trace = decoder.trace(soft[0], iterations=3)
    assert np.array_equal(trace.bits, decoder.decode(soft[0], iterations=3))
    assert len(trace.passes) == 6
    last = trace.passes[-1]
    assert {name: values.shape for name, values in last.items()} == {
        "int": (43,), "a": (43, 8), "b": (43, 8), "g": (43, 4), "llr": (43,), "ext": (43,),
    }  # fmt: skip
    assert np.array_equal(last["llr"][:40] >= 0, trace.bits)
    assert np.array_equal(trace.inputs["code1_sys"][:40], soft[0, 0, :40])
    assert np.array_equal(trace.inputs["code2_par0"][:40], soft[0, 2, :40])


class Inputs(ctypes.Structure):
    _fields_ = [(name, ctypes.POINTER(ctypes.c_int)) for name in ("rsc1_sys", "rsc1_par", "rsc2_par")] + [
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


def text_of_the_library(soft, iterations, passes):
    """What a C program with the default generics gets, line by line."""
    library = ctypes.CDLL(os.environ["QUARZEL_LIBRARY"])
    lines = []
    receiver = ctypes.CFUNCTYPE(None, ctypes.c_void_p, ctypes.c_int, ctypes.c_char_p)(
        lambda cookie, kind, text: lines.append(text.decode() + "\n")
    )
    generics = ctypes.create_string_buffer(72)
    library.vardel_ip_quarzel_get_default_generics(generics)
    library.vardel_ip_quarzel_create_state_with_messages.restype = ctypes.c_void_p
    state = ctypes.c_void_p(library.vardel_ip_quarzel_create_state_with_messages(generics, receiver, None))
    positions = soft.shape[1]
    bits = ctypes.create_string_buffer(positions)
    streams = [(ctypes.c_int * positions)(*map(int, stream)) for stream in soft]
    outputs = Outputs(ctypes.addressof(bits), positions, 0, 0)
    dump_config = "_Z36vardel_ip_quarzel_bitacc_dump_configP23vardel_ip_quarzel_statej"
    library[dump_config](state, passes)
    assert library.vardel_ip_quarzel_bitacc_simulate(
        state, ctypes.byref(outputs), Inputs(*streams, positions, iterations, 0)
    ) == 0  # fmt: skip
    library.vardel_ip_quarzel_destroy_state(state)
    return "".join(lines)


@pytest.mark.parametrize("K", [40, 1024])
def test_text_is_that_of_the_library(rng, K, tmp_path):
    soft = rng.integers(-128, 128, (3, K + 4), dtype=np.int8)
    trace = quarzel.Decoder().trace(soft, iterations=4, passes=7)
    assert trace.text == text_of_the_library(soft, 4, 7)
    file = tmp_path / "trace.txt"
    trace.save(file)
    (read,) = quarzel.read_trace(file)
    assert read.text == trace.text
    assert read.bits is None
    for ours, theirs in zip([trace.inputs, *trace.passes], [read.inputs, *read.passes]):
        assert list(ours) == list(theirs)
        assert all(np.array_equal(ours[name], theirs[name]) for name in ours)


def test_text_is_that_of_the_tool(soft, captures, tool, tmp_path):
    model = tmp_path / "model.txt"
    subprocess.run(
        [tool, "decode", captures / "k40.soft.npy", "--units", "8", "--trace", "4", "--trace-file", model],
        check=True, capture_output=True,
    )  # fmt: skip
    trace = quarzel.Decoder(8).trace(soft[0], iterations=6, passes=4)
    assert trace.text == model.read_text()
    ours = tmp_path / "ours.txt"
    trace.save(ours)
    assert subprocess.run([tool, "trace-diff", model, ours], capture_output=True).returncode == 0


def test_traces_compare_by_their_arrays_and_have_a_short_repr(soft):
    decoder = quarzel.Decoder()
    first = decoder.trace(soft[0], iterations=2)
    assert repr(first) == "<BlockTrace: block 0, K = 40, 4 passes>"
    assert first == quarzel.Decoder().trace(soft[0], iterations=2)
    assert first == pickle.loads(pickle.dumps(first))
    assert first != decoder.trace(soft[0], iterations=2), "another block of the decoder"
    assert first != quarzel.Decoder().trace(soft[0], iterations=3)
    assert first != quarzel.Decoder().trace(soft[1], iterations=2)
    assert first != "a trace"
    other = copy.deepcopy(first)
    other.passes[3]["b"][42, 7] += 1
    assert first != other


def test_blocks_are_counted_on(soft):
    decoder = quarzel.Decoder()
    decoder.decode(soft[:3])
    trace = decoder.trace(soft[3], passes=1)
    assert trace.block == 3
    assert len(trace.passes) == 1


def test_refuses_more_than_one_block_and_no_pass(soft):
    with pytest.raises(ValueError, match="one block"):
        quarzel.Decoder().trace(soft)
    with pytest.raises(ValueError, match="passes must be 1 or more"):
        quarzel.Decoder().trace(soft[0], passes=0)
    with pytest.raises(ValueError, match="iterations"):
        quarzel.Decoder().trace(soft[0], iterations=-1)


@pytest.mark.parametrize("damage", [lambda text: "", lambda text: text[:-30], lambda text: text.replace("itsSys", "its")])
def test_refuses_what_is_not_a_whole_trace(soft, tmp_path, damage):
    file = tmp_path / "trace.txt"
    file.write_text(damage(quarzel.Decoder().trace(soft[0], passes=1).text))
    with pytest.raises(ValueError, match="not a (whole )?trace of the model"):
        quarzel.read_trace(file)
