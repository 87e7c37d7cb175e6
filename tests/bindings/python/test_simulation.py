# SPDX-License-Identifier: MIT
"""Sweeps: the same file as the tool's, callbacks, interruptions, refusals, pictures."""

import json
import subprocess
import sys
from pathlib import Path

import numpy as np
import pytest

import quarzel

SMALL = {"block_size": [40, 64], "algorithm": ["max-log", 2], "iterations": 4, "max_blocks": 300, "seed": 7}


@pytest.fixture(scope="module")
def result():
    return quarzel.sweep([0.4, 1.2], **SMALL)


def test_the_result_is_the_file_of_the_tool(result, tool, tmp_path):
    ours, theirs = tmp_path / "ours.json", tmp_path / "theirs.json"
    result.save(ours)
    subprocess.run(
        [tool, "sweep", "--block-size", "40,64", "--algorithm", "0,2", "--iterations", "4",
         "--max-blocks", "300", "--seed", "7", "--ebn0", "0.4,1.2", "-o", theirs],
        check=True, capture_output=True,
    )  # fmt: skip
    assert ours.read_bytes() == theirs.read_bytes()
    assert quarzel.SweepResult.read(theirs).curves == result.curves


def test_threads_do_not_matter(result):
    assert quarzel.sweep([0.4, 1.2], **SMALL, threads=3).text == result.text


def test_rates_are_those_of_decoding_one_by_one(result):
    assert [str(curve) for curve in result.curves][:2] == [
        "K = 40, 2 units, max-log, 4 iterations, llr 4",
        "K = 40, 2 units, max-star, 4 iterations, llr 4",
    ]
    for curve in result.curves:
        assert (curve.ebn0_db == [0.4, 1.2]).all()
        for point in curve.points:
            assert point.bits == point.blocks * curve.block_size
            assert point.ber == point.bit_errors / point.bits
            low, high = point.bler_interval
            assert low < point.bler < high
    assert (result.curves[0].bler > result.curves[1].bler).all(), "max-log loses against max-star"


def test_quantisers_are_a_dimension():
    result = quarzel.sweep(1.0, block_size=40, max_blocks=100, llr=[2, 0.5])
    assert [(curve.quantiser, curve.scale) for curve in result.curves] == [("llr", 0.5), ("llr", 2)]
    assert quarzel.sweep(1.0, block_size=40, max_blocks=100, llr=2).curves == result.curves[1:]


def test_a_coded_link_gives_the_file_of_the_tool(tool, tmp_path):
    for ours, theirs in (
        (
            {"block_size": 104, "code_rate": 0.75, "modulation": ["16qam", "bpsk"], "channel": ["awgn", "rayleigh"],
             "demapping": "exact", "rv": [0, 2]},
            ["--block-size", "104", "--code-rate", "3/4", "--modulation", "16qam,bpsk", "--channel", "awgn,rayleigh",
             "--demapping", "exact", "--rv", "0,2"],
        ),
        (
            {"transport_block": [90, 6200], "code_rate": 0.5, "modulation": "qpsk", "channel": "rayleigh-block",
             "harq": 3, "stop": "crc"},
            ["--transport-block", "90,6200", "--code-rate", "1/2", "--modulation", "qpsk",
             "--channel", "rayleigh-block", "--harq", "3", "--stop", "crc"],
        ),
    ):  # fmt: skip
        file = tmp_path / "theirs.json"
        result = quarzel.sweep([1.0, 4.0], max_blocks=40, **ours)
        subprocess.run([tool, "sweep", "--ebn0", "1,4", "--max-blocks", "40", *theirs, "-o", file],
                       check=True, capture_output=True)  # fmt: skip
        assert file.read_text() == result.text
        file.unlink()


def test_a_coded_link_is_told():
    result = quarzel.sweep([2.0], transport_block=90, code_rate=0.5, harq=2, stop="crc", max_blocks=50)
    (curve,) = result.curves
    assert (curve.information_bits, curve.coded_bits, curve.redundancy_versions, curve.stop) == (90, 180, (0, 2), "crc")
    assert str(curve) == "A = 90, 2 units, scaled-max-log, 6 iterations, llr 4, 180 coded bits, rv 0 2, stop crc"
    (point,) = curve.points
    assert len(point.transmissions) == 2 and point.transmissions[-1]["block_errors"] == point.block_errors
    assert len(point.iterations_used) == 6 and 1 <= point.mean_iterations <= 6
    assert 0 < point.throughput <= 0.5


def test_stored_coded_links_are_read():
    data = Path(__file__).parents[2] / "sweep" / "data"
    curves = quarzel.SweepResult.read(data / "coded_links.json").curves
    assert {"bpsk", "16qam", "256qam"} <= {curve.modulation for curve in curves}
    assert {(curve.demapping, len(curve.redundancy_versions)) for curve in curves} == {("exact", 3)}
    assert all(curve.transport_block for curve in quarzel.SweepResult.read(data / "transport_blocks.json").curves)


def test_a_result_of_an_older_version_is_read():
    old = quarzel.SweepResult.read(Path(__file__).parents[2] / "sweep" / "data" / "small_sweep.json")
    assert json.loads(old.text)["version"] == 2
    assert (old.seed, len(old.curves), old.curves[0].points[0].blocks) == (7, 4, 98)
    assert old.curves[0].scale == 8


def test_points_are_told_in_order_as_they_end(result):
    told = []
    quarzel.sweep([0.4, 1.2], **SMALL, on_point=lambda curve, point: told.append((curve.algorithm, point)))
    assert told == [(curve.algorithm, point) for curve in result.curves for point in curve.points]


def test_what_a_callback_raises_ends_the_sweep():
    class Enough(Exception):
        pass

    def stop(curve, point):
        raise Enough

    with pytest.raises(Enough):
        quarzel.sweep(np.arange(-20, 40, 0.1), max_blocks=10**9, max_block_errors=1, on_point=stop)


def test_errors_after_each_iteration():
    (curve,) = quarzel.sweep(1.0, block_size=40, iterations=3, max_blocks=100, per_iteration=True).curves
    (point,) = curve.points
    assert len(point.per_iteration) == 3
    assert point.per_iteration[-1] == {"bit_errors": point.bit_errors, "block_errors": point.block_errors}


@pytest.mark.parametrize(
    "arguments, text",
    [
        ({"block_size": 41}, "block size 41 is not possible; give one of the 188 sizes"),
        ({"algorithm": "log-map"}, "choose one of max-log"),
        ({"algorithm": 3}, "algorithm must be 0, 1 or 2, not 3"),
        ({"units": []}, "units"),
        ({"max_blocks": 0}, "number of blocks"),
        ({"seed": -1}, "seed must be a number from 0 to 18446744073709551615, not -1"),
        ({"seed": 2**64}, "seed must be a number from 0"),
        ({"llr": 8, "scale": 8}, "give one of them"),
        ({"scale": 0}, "scale must be above 0 and finite, not 0"),
        ({"threads": 0}, "threads must be a number from 1 to 1024, not 0"),
        ({"threads": 2**40}, "threads must be a number from 1 to 1024"),
        ({"block_size": 10**30}, "block_size must be a number from 40 to 6144"),
        ({"units": 3}, "units must be 2, 4 or 8, not 3"),
        ({"iterations": [4, 16]}, "iterations must be a number from 1 to 15, not 16"),
        ({"ebn0_db": [[1.0], [1.0, 2.0]]}, "ebn0_db is not an array"),
        ({"scale": "8"}, "scale must be a number, not str"),
        ({"ebn0_db": []}, "no Eb/N0"),
        ({"ebn0_db": [100]}, "outside -20 to 40 dB"),
        ({"ebn0_db": [float("nan")]}, "finite"),
        ({"modulation": "8psk"}, "there is no modulation '8psk'; choose bpsk, qpsk, 16qam, 64qam, 256qam"),
        ({"channel": ["awgn", 1]}, "there is no channel 1; choose awgn, rayleigh, rayleigh-block"),
        ({"demapping": "none"}, "there is no demapping 'none'; choose maxlog, exact"),
        ({"code_rate": 1.5}, "a code rate is above 0 and up to 1"),
        ({"coded_bits": 0}, "coded_bits must be a number from 1 to 16777216, not 0"),
        ({"transport_block": 40}, "coded bits of a transmission are not told; give code_rate or coded_bits"),
        ({"transport_block": 40, "block_size": 40, "code_rate": 0.5}, "leave out block_size"),
        ({"stop": "crc"}, "code blocks alone have no CRC to stop at; give transport blocks"),
        ({"rv": 4}, "rv must be a number from 0 to 3, not 4"),
        ({"harq": 0}, "harq must be a number from 1 to 32, not 0"),
    ],
)
def test_refuses_what_is_not_possible(arguments, text):
    with pytest.raises((ValueError, TypeError), match=text):
        quarzel.sweep(**{"ebn0_db": 1.0, **arguments})


def test_refuses_an_altered_file(result, tmp_path):
    file = tmp_path / "altered.json"
    file.write_text(result.text.replace('"seed": 7', '"seed": 8'))
    with pytest.raises(ValueError, match=";"):
        quarzel.SweepResult.read(file)


def test_plots_the_rates_with_their_intervals(result):
    matplotlib = pytest.importorskip("matplotlib")
    matplotlib.use("Agg")
    axes = result.plot(rate="ber")
    assert len(axes.get_legend().get_texts()) == 4
    assert axes.get_yscale() == "log"
    with pytest.raises(ValueError, match="choose 'ber' or 'bler'"):
        result.plot(rate="wer")


def test_a_table_has_a_row_for_each_point(result):
    pandas = pytest.importorskip("pandas")
    table = result.to_dataframe()
    assert isinstance(table, pandas.DataFrame)
    points = [(curve, point) for curve in result.curves for point in curve.points]
    assert len(table) == len(points) == 8
    for (curve, point), row in zip(points, table.itertuples()):
        assert (row.block_size, row.algorithm, row.ebn0_db) == (curve.block_size, curve.algorithm, point.ebn0_db)
        assert (row.bit_errors, row.bler, row.bler_low, row.bler_high) == (
            point.bit_errors, point.bler, *point.bler_interval
        )  # fmt: skip
    assert not {"per_iteration", "modulation", "throughput"} & set(table)
    coded = quarzel.sweep(3.0, modulation=["qpsk", "bpsk"], harq=2, max_blocks=8).to_dataframe()
    assert list(coded["modulation"]) == ["bpsk", "qpsk"]
    assert (coded["throughput"] > 0).all() and "transmissions" not in coded


def test_a_table_without_pandas_says_what_it_needs(result, monkeypatch):
    monkeypatch.setitem(sys.modules, "pandas", None)
    with pytest.raises(ImportError, match="to_dataframe needs pandas; install it"):
        result.to_dataframe()
