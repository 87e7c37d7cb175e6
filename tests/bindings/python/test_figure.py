# SPDX-License-Identifier: MIT
"""Figures: the points that the tool draws, and refusals."""

import csv
import subprocess

import numpy as np
import pytest

import quarzel

matplotlib = pytest.importorskip("matplotlib")
matplotlib.use("Agg")


@pytest.fixture(scope="module")
def results():
    same = {"block_size": 40, "algorithm": ["max-log", "max-star"], "iterations": 4, "max_blocks": 200, "seed": 3}
    return [quarzel.sweep([0.0, 1.0], **same), quarzel.sweep([1.0, 2.0, 7.0], **same)]


def drawn(figure, panel):
    """The points, ends of the bars and bounds of a panel."""
    axes = figure.axes[panel]
    points = [(x, y) for container in axes.containers for x, y in zip(*container[0].get_data())]
    ends = [tuple(bar[:, 1]) for container in axes.containers for bar in container[2][0].get_segments()]
    bounds = [xy for line in axes.lines if line.get_marker() == "v" for xy in zip(*line.get_data())]
    return points, ends, bounds


def test_draws_the_points_that_the_tool_draws(results, tool, tmp_path):
    files = [tmp_path / f"{index}.json" for index in range(len(results))]
    for result, file in zip(results, files):
        result.save(file)
    table = tmp_path / "drawn.csv"
    subprocess.run([tool, "plot", *files, "--csv", table, "--x", "esn0", "-o", tmp_path / "drawn.svg"], check=True)
    rows = list(csv.DictReader(table.open()))
    figure = quarzel.plot(results, x="esn0")
    for panel, rate in enumerate(("ber", "bler")):
        ours = [row for row in rows if row["rate"] == rate]
        seen = [row for row in ours if float(row["value"]) > 0]
        silent = [row for row in ours if float(row["value"]) == 0]
        assert seen and silent
        points, ends, bounds = drawn(figure, panel)
        assert np.allclose(points, [(float(row["esn0_db"]), float(row["value"])) for row in seen], rtol=1e-8)
        assert np.allclose(ends, [(float(row["low"]), float(row["high"])) for row in seen], rtol=1e-9)
        assert np.allclose(bounds, [(float(row["esn0_db"]), float(row["high"])) for row in silent], rtol=1e-8)
        labels = list(dict.fromkeys(row["curve"] for row in ours))
        texts = figure.axes[panel].get_legend_handles_labels()[1]
        assert sorted(texts) == sorted([*labels, "no error: 95 % upper bound"])


def test_takes_size_labels_title_and_the_uncoded_curve(results):
    figure = quarzel.plot(
        results[0], panel="ber", uncoded=True, size=(3.5, 2.5), labels=["a", "b"], title="T", legend="lower left"
    )
    assert tuple(figure.get_size_inches()) == (3.5, 2.5)
    (axes,) = figure.axes
    assert {"a", "b", "uncoded BPSK"} <= {text.get_text() for text in axes.get_legend().get_texts()}
    assert figure._suptitle.get_text() == "T"


@pytest.mark.parametrize(
    "arguments, text",
    [
        ({"panel": "wer"}, "there is no panel 'wer'; choose 'ber', 'bler' or 'both'"),
        ({"x": "snr"}, "there is no axis 'snr'; choose 'ebn0' or 'esn0'"),
        ({"labels": ["a"]}, "the labels are 1 and the curves 2; give one for each"),
    ],
)
def test_refuses_what_is_not_possible(results, arguments, text):
    with pytest.raises(ValueError, match=text):
        quarzel.plot(results, **arguments)
    with pytest.raises(ValueError, match="there is no curve; give the result of a sweep"):
        quarzel.plot([])
