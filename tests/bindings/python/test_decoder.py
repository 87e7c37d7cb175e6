# SPDX-License-Identifier: MIT
"""Decoding: bits, shapes, types, and what is refused."""

import contextlib
import copy
import gc
import multiprocessing
import pickle
import signal
import threading
import time
import warnings
from pathlib import Path

import numpy as np
import pytest
from conftest import soft_of
from hypothesis import given
from hypothesis import strategies as st

import quarzel


def noisy(rng, blocks, K):
    return rng.integers(-40, 41, (*blocks, 3, K + 4), dtype=np.int8)


@pytest.mark.parametrize("name", ["k40", "k6144"])
def test_decides_as_the_core_did(captures, name):
    soft = np.load(captures / f"{name}.soft.npy")
    decided = np.load(captures / f"{name}.decided.npy")
    with quarzel.Decoder(units=8) as decoder:
        assert np.array_equal(decoder.decode(soft, packed=True), decided)
        assert np.array_equal(decoder.decode(soft[0]), np.unpackbits(decided[0]))


@given(
    K=st.sampled_from(quarzel.block_sizes[:60]),
    units=st.sampled_from([2, 4, 8]),
    algorithm=st.sampled_from(quarzel.algorithms),
    seed=st.integers(0, 2**32 - 1),
)
def test_a_round_trip_gives_the_bits_back(K, units, algorithm, seed):
    bits = np.random.default_rng(seed).integers(0, 2, (2, K), dtype=np.uint8)
    decoded = quarzel.Decoder(units, algorithm).decode(soft_of(quarzel.encode(bits)), iterations=2)
    assert decoded.dtype == np.uint8
    assert np.array_equal(decoded, bits)


@pytest.mark.parametrize("dtype", [np.int8, np.int16, np.int32, ">i2"])
@pytest.mark.parametrize("shape", [(), (5,), (2, 3), (0,)])
def test_every_type_and_layout_means_the_same(rng, dtype, shape):
    K = 64
    soft = noisy(rng, shape, K)
    decoder = quarzel.Decoder()
    expected = decoder.decode(soft)
    assert expected.shape == (*shape, K)
    typed = soft.astype(dtype)
    streams = [typed[..., stream, :] for stream in range(3)]
    assert np.array_equal(decoder.decode(typed), expected)
    assert np.array_equal(decoder.decode(*streams), expected)
    assert np.array_equal(decoder.decode(np.asfortranarray(typed)), expected)
    backwards = [stream[..., ::-1].copy()[..., ::-1] for stream in streams]
    assert np.array_equal(decoder.decode(*backwards), expected)
    assert np.array_equal(decoder.decode(streams[0].copy(), *backwards[1:]), expected)
    assert np.array_equal(decoder.decode(typed[..., ::-1].copy()[..., ::-1]), expected)


def test_streams_of_several_types_are_taken_as_they_are(rng):
    soft = noisy(rng, (3,), 40)
    streams = soft[:, 0], soft[:, 1].astype(np.int32), soft[:, 2].astype(np.int16)
    assert np.array_equal(quarzel.Decoder().decode(*streams), quarzel.Decoder().decode(soft))


def test_a_batch_is_its_blocks(rng):
    soft = noisy(rng, (70,), 512)
    batch = quarzel.Decoder(8, "max-star").decode(soft, iterations=3)
    single = [quarzel.Decoder(8, 2).decode(block, iterations=3) for block in soft]
    assert np.array_equal(batch, single)


def test_a_stream_may_be_the_same_for_all_blocks(rng):
    soft = noisy(rng, (5,), 40)
    parity = np.broadcast_to(soft[0, 1], soft[:, 1].shape)
    copied = parity.copy()
    decoder = quarzel.Decoder()
    assert np.array_equal(decoder.decode(soft[:, 0], parity, parity), decoder.decode(soft[:, 0], copied, copied))


def test_every_implementation_decides_alike(rng):
    soft = noisy(rng, (40,), 512)
    names = quarzel.implementations()
    assert names[-1] == "literal"
    assert quarzel.Decoder().implementation == names[0]
    expected = quarzel.Decoder().decode(soft)
    for name in names:
        decoder = quarzel.Decoder(implementation=name)
        assert decoder.implementation == name
        assert np.array_equal(decoder.decode(soft), expected)


@pytest.mark.parametrize("shape", [(), (40,), (2, 3), (0,)])
def test_the_decisions_of_every_iteration_are_those_of_shorter_decodes(rng, shape):
    soft = noisy(rng, shape, 64)
    decoder = quarzel.Decoder(4, "max-star")
    every = decoder.decode_every_iteration(soft, iterations=4)
    assert every.shape == (*shape, 4, 64)
    for iterations in range(1, 5):
        assert np.array_equal(every[..., iterations - 1, :], decoder.decode(soft, iterations=iterations))
    with pytest.raises(ValueError, match="from 1 to 15, not -1"):
        decoder.decode_every_iteration(soft, iterations=-1)


def test_packed_bits_are_those_of_packbits(rng):
    soft = noisy(rng, (4,), 48)
    decoder = quarzel.Decoder()
    assert np.array_equal(decoder.decode(soft, packed=True), np.packbits(decoder.decode(soft), axis=-1))


def test_tags_come_back_masked(rng):
    decoder = quarzel.Decoder(tag_width=4)
    soft = noisy(rng, (2, 2), 40)
    with pytest.warns(quarzel.ModelWarning, match="tag has been truncated to 4 bits"):
        bits, tags = decoder.decode(soft, tags=[[1, 15], [16, 18]])
    assert bits.shape == (2, 2, 40)
    assert np.array_equal(tags, [[1, 15], [0, 2]])


def test_the_first_saturation_is_a_warning_that_names_the_line_of_the_user(capfd):
    soft = np.full((3, 44), 200, dtype=np.int16)
    decoder = quarzel.Decoder()
    with pytest.warns(quarzel.ModelWarning, match="position 0 saturated positively") as caught:
        decoder.decode(soft)
    assert caught[0].filename == __file__
    with warnings.catch_warnings():
        warnings.simplefilter("error")
        decoder.decode(soft)
        with pytest.raises(quarzel.ModelWarning):
            quarzel.Decoder().decode(soft)
    assert capfd.readouterr() == ("", "")


@pytest.mark.parametrize(
    "soft, error, text",
    [
        (np.zeros((3, 44)), TypeError, r"must be int8, int16 or int32, not float64; .*quarzel\.quantise\(systematic\)"),
        (np.zeros((3, 44), np.int64), TypeError, r"not int64; use systematic\.astype\(numpy\.int8\)"),
        (np.zeros((3, 44), np.uint8), TypeError, "not uint8"),
        (np.zeros((3, 45), np.int8), ValueError, r"of 45 soft values; .* 44 \(K = 40\), 52 \(K = 48\)"),
        (np.zeros((3, 7000), np.int8), ValueError, r"nearest that have one: 6148 \(K = 6144\)"),
        (np.zeros((3, 0), np.int8), ValueError, r"nearest that have one: 44 \(K = 40\)"),
        (np.zeros((2, 44), np.int8), ValueError, r"shape \(2, 44\) does not hold three streams"),
        (np.int8(1), ValueError, "does not hold three streams"),
        ([], TypeError, r"not float64; it is empty: give K \+ 4 soft values"),
        (np.zeros(0, np.int8), ValueError, r"shape \(0,\) does not hold three streams"),
        (np.ma.masked_less(np.zeros((3, 44), np.int8), 0), TypeError, r"masked array, .* use systematic\.filled\(0\)"),
        ([[1, 2], [3]], ValueError, "systematic is not an array: its rows must have the same length"),
        ("soft", TypeError, "not <U4"),
    ],
)
def test_refuses_soft_values_with_a_remedy(soft, error, text):
    with pytest.raises(error, match=text):
        quarzel.Decoder().decode(soft)


def test_refuses_streams_that_do_not_fit_together():
    stream = np.zeros(44, np.int8)
    with pytest.raises(ValueError, match=r"shapes \(44,\), \(44,\), \(52,\)"):
        quarzel.Decoder().decode(stream, stream, np.zeros(52, np.int8))
    with pytest.raises(ValueError, match="one parity is missing"):
        quarzel.Decoder().decode(stream, stream)
    with pytest.raises(ValueError, match="tags have the shape"):
        quarzel.Decoder().decode(stream, stream, stream, tags=[1])
    with pytest.raises(TypeError, match="parity2 is a masked array"):
        quarzel.Decoder().decode(stream, stream, np.ma.zeros(44, np.int8))
    for tag, error in ((2**32, ValueError), (-1, ValueError), (10**30, TypeError), (1.0, TypeError)):
        with pytest.raises(error, match="tags must be .*from 0 to 4294967295"):
            quarzel.Decoder().decode(stream, stream, stream, tags=tag)


@pytest.mark.parametrize(
    "arguments, error, text",
    [
        ({"units": 3}, ValueError, "units must be 2, 4 or 8, not 3"),
        ({"units": 10**30}, ValueError, "units must be 2, 4 or 8, not 10{30}"),
        ({"units": 2.0}, TypeError, "units must be 2, 4 or 8, not float"),
        ({"units": "4"}, TypeError, "units must be 2, 4 or 8, not '4'"),
        ({"algorithm": "log-map"}, ValueError, "choose one of max-log, scaled-max-log, max-star"),
        ({"algorithm": 3}, ValueError, "algorithm must be 0, 1 or 2"),
        ({"algorithm": None}, TypeError, "algorithm must be 0, 1 or 2, not NoneType"),
        ({"tag_width": 33}, ValueError, "tag_width must be a number from 0 to 32, not 33"),
        ({"tag_width": -(2**40)}, ValueError, "tag_width must be a number from 0 to 32, not -1099511627776"),
        ({"implementation": 3}, ValueError, "no implementation 3; .* choose one of .*literal$"),
        ({"implementation": "\ud800"}, ValueError, "choose one of .*literal$"),
        ({"implementation": "abacus"}, ValueError, "no implementation 'abacus'; leave it out .* choose one of .*literal$"),
        ({"implementation": ""}, ValueError, "no implementation ''; leave it out for the fastest one"),
    ],
)
def test_refuses_cores_that_there_are_not(arguments, error, text):
    with pytest.raises(error, match=text):
        quarzel.Decoder(**arguments)


@pytest.mark.parametrize(
    "iterations, error, text",
    [
        (0, ValueError, "a number from 1 to 15, not 0"),
        (16, ValueError, "a number from 1 to 15, not 16"),
        (10**30, ValueError, "a number from 1 to 15, not 10{30}"),
        (6.0, TypeError, "a whole number, not float"),
        (None, TypeError, "a whole number, not NoneType"),
    ],
)
def test_refuses_iterations_that_the_core_does_not_have(iterations, error, text):
    soft = np.zeros((3, 44), np.int8)
    decoder = quarzel.Decoder()
    for call in (decoder.decode, decoder.decode_every_iteration, decoder.trace):
        with pytest.raises(error, match=f"iterations must be {text}"):
            call(soft, iterations=iterations)


@pytest.mark.parametrize("again", [copy.copy, copy.deepcopy, lambda decoder: pickle.loads(pickle.dumps(decoder))])
def test_a_copy_has_the_settings_and_a_fresh_core(rng, again):
    soft = noisy(rng, (3,), 64)
    decoder = quarzel.Decoder(8, "max-star", tag_width=3, implementation="literal")
    expected = decoder.decode(soft)
    decoder.close()
    other = again(decoder)
    assert repr(other) == repr(decoder)
    assert other.implementation == "literal"
    assert np.array_equal(other.decode(soft), expected)
    assert again(other).trace(soft[0]).block == 0


def test_process_pools_take_decoders(rng):
    soft = noisy(rng, (4,), 64)
    decoder = quarzel.Decoder(4)
    context = multiprocessing.get_context("spawn")
    with context.Pool(1) as pool:
        decided = pool.map(decoder.decode, soft)
    assert np.array_equal(decided, decoder.decode(soft))


def test_settings_cannot_be_set():
    decoder = quarzel.Decoder()
    for name in ("units", "algorithm", "tag_width", "implementation", "iterations"):
        with pytest.raises(AttributeError, match=f"^{name} cannot be set: .* make another one with Decoder"):
            setattr(decoder, name, 4)

    class Named(quarzel.Decoder):
        pass

    named = Named()
    named.label = "mine"
    with pytest.raises(AttributeError, match="units cannot be set"):
        named.units = 4


def test_the_package_and_its_coding_chain_are_the_only_public_modules():
    package = Path(quarzel.__file__).parent
    sources = [source.name for source in (Path(__file__).parents[3] / "bindings/python/quarzel").glob("*.py")]
    assert all((package / name).exists() for name in sources)
    assert [name for name in sources if not name.startswith("_")] == ["lte.py"]
    for module in (quarzel, quarzel.lte):
        for name in module.__all__:
            assert getattr(getattr(module, name), "__module__", module.__name__) in (module.__name__, "typing")


def test_quantise_rounds_and_clips():
    assert quarzel.quantise([[0.1, -0.2], [31.8, -40]]).tolist() == [[0, -1], [127, -128]]
    ratios = np.array([np.inf, -np.inf, 0.375], dtype=np.float32)
    assert quarzel.quantise(ratios, scale=8).tolist() == [127, -128, 3]
    assert quarzel.quantise([]).dtype == np.int8
    assert quarzel.quantise(2.5).shape == ()
    assert quarzel.quantise([0.125, 0.375, -0.125, -0.375]).tolist() == [0, 2, 0, -2]


@pytest.mark.parametrize("dtype", [np.float16, np.float32, np.float64, np.longdouble, ">f4", np.int8, np.uint32])
def test_quantise_takes_every_real_type_and_layout(dtype):
    ratios = np.arange(24).astype(dtype).reshape(2, 3, 4)
    expected = np.clip(4 * np.arange(24).reshape(2, 3, 4), -128, 127)
    assert (quarzel.quantise(ratios) == expected).all()
    assert (quarzel.quantise(ratios[:, ::-2].T) == expected[:, ::-2].T).all()


@pytest.mark.parametrize(
    "ratios, scale, error, text",
    [
        ([1.0, float("nan")], 4, ValueError, r"1 of 2 values are not a number \(NaN\); 0 says that a bit is unknown"),
        ([1.0], 0, ValueError, "scale must be above 0 and finite, not 0"),
        ([1.0], float("inf"), ValueError, "scale must be above 0 and finite, not inf"),
        ([1.0], "4", TypeError, "scale must be a number, not str"),
        ([1j], 4, TypeError, "llr must hold real numbers, not complex128"),
        (np.ma.zeros(3), 4, TypeError, r"llr is a masked array, .* use llr\.filled\(0\)"),
    ],
)
def test_quantise_refuses_what_has_no_soft_value(ratios, scale, error, text):
    with pytest.raises(error, match=text):
        quarzel.quantise(ratios, scale)


def test_a_closed_decoder_says_so():
    with quarzel.Decoder() as decoder:
        pass
    decoder.close()
    with pytest.raises(ValueError, match="closed; make a new one"):
        decoder.decode(np.zeros((3, 44), np.int8))
    with pytest.raises(ValueError, match="closed"):
        decoder.trace(np.zeros((3, 44), np.int8))


def test_a_signal_ends_a_long_batch(rng):
    class Stopped(Exception):
        pass

    def stop(number, frame):
        raise Stopped

    block = noisy(rng, (), 6144)
    decoder = quarzel.Decoder(8, "max-star")
    before = signal.signal(signal.SIGALRM, stop)
    try:
        with pytest.raises(Stopped):
            signal.setitimer(signal.ITIMER_REAL, 0.01)
            decoder.decode(np.broadcast_to(block, (10000, *block.shape)), iterations=15)
    finally:
        signal.setitimer(signal.ITIMER_REAL, 0)
        signal.signal(signal.SIGALRM, before)
    assert np.array_equal(decoder.decode(block), quarzel.Decoder(8, "max-star").decode(block))


def test_threads_with_a_decoder_each_run_side_by_side_and_one_decoder_takes_one_thread(rng):
    soft = noisy(rng, (400,), 1024)
    decoder = quarzel.Decoder()
    end = time.monotonic() + 60
    started = threading.Event()
    refused = []

    def disturb():
        started.wait()
        while thread.is_alive():
            try:
                decoder.decode(soft[0])
            except RuntimeError as error:
                refused.append(str(error))
                return

    def decode():
        started.set()
        while not refused and time.monotonic() < end:
            with contextlib.suppress(RuntimeError):
                decoder.decode(soft)

    thread = threading.Thread(target=decode)
    disturber = threading.Thread(target=disturb)
    thread.start()
    disturber.start()
    # This thread gets on meanwhile: the GIL is free.
    while thread.is_alive():
        gc.collect(0)
    disturber.join()
    assert refused == ["the decoder is in use by another thread; give each thread a decoder of its own"]
