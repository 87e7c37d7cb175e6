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
    assert "per_iteration" not in table


def test_a_table_without_pandas_says_what_it_needs(result, monkeypatch):
    monkeypatch.setitem(sys.modules, "pandas", None)
    with pytest.raises(ImportError, match="to_dataframe needs pandas; install it"):
        result.to_dataframe()
