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


def rows_of(tool, tmp_path, *arguments):
    """What the tool draws."""
    table = tmp_path / "drawn.csv"
    subprocess.run([tool, "plot", *arguments, "--csv", table, "-o", tmp_path / "drawn.svg"], check=True)
    return list(csv.DictReader(table.open()))


def lines_of(axes):
    """The lines without bars, by their labels."""
    return {line.get_label(): list(zip(*line.get_data())) for line in axes.lines if len(line.get_data()[0])}


def expect_lines(axes, rows, kind, x="ebn0_db"):
    wanted = {}
    for row in rows:
        if row["kind"] == kind and float(row["value"]) > 0:
            wanted.setdefault(row["curve"], []).append((float(row[x]), float(row["value"])))
    assert wanted
    found = lines_of(axes)
    for label, points in wanted.items():
        assert np.allclose(found[label], points, rtol=1e-8), label


def test_draws_the_iterations_that_the_tool_draws(tool, tmp_path):
    result = quarzel.sweep([0.0, 1.0], block_size=40, iterations=[2, 3], max_blocks=200, per_iteration=True)
    result.save(tmp_path / "a.json")
    rows = rows_of(tool, tmp_path, tmp_path / "a.json", "--per-iteration", "--iterations", "1,3", "--panel", "bler")
    (axes,) = quarzel.plot(result, per_iteration=True, iterations=[3, 1], panel="bler").axes
    expect_lines(axes, rows, "iteration")
    assert list(lines_of(axes)) == ["after 1 iteration", "after 3 iterations"]
    (axes,) = quarzel.plot(result.curves[0], per_iteration=True, labels=["a", "b"], panel="ber").axes
    assert list(lines_of(axes)) == ["a", "b"], "a curve alone"


def test_draws_the_references_that_the_tool_draws(results, tool, tmp_path):
    reference = tmp_path / "theirs.csv"
    reference.write_text(
        "# comment\n"
        "K, code_bits, decoder, ebn0_db, blocks, bit_errors, block_errors\n"
        "40, 132, a, 0.5, 100, 80, 20\n"
        "40, 132, a, 1.5, 100, 8, 0.02 (rate)\n"
        "40, 132, b, 1, 100, 0, 4\n"
        "48, 156, a, 1, 100, 10, 5\n"
    )
    results[0].save(tmp_path / "a.json")
    chosen = [tmp_path / "a.json", "--x", "esn0", "--block-size", "40"]
    rows = rows_of(tool, tmp_path, *chosen, "--reference", f"x={reference}")
    figure = quarzel.plot(results[0], x="esn0", block_size=40, references={"x": reference})
    for axes, rate in zip(figure.axes, ("ber", "bler")):
        expect_lines(axes, [row for row in rows if row["rate"] == rate], "reference", "esn0_db")
    figure = quarzel.plot(results[0], panel="bler", references=reference)
    assert [text for text in figure.axes[0].get_legend_handles_labels()[1] if text.startswith("theirs")] == [
        "theirs, K = 40, a", "theirs, K = 40, b", "theirs, K = 48, a"
    ]  # fmt: skip


@pytest.mark.parametrize(
    "content, text",
    [
        ("ebn0_db,x\n1,2\n", "is missing a column; give CSV with the columns ebn0_db and ber, bler or both"),
        ("ebn0_db,ber\none,0.1\n", "line 2: 'one' is not a number; give CSV"),
        ("ebn0_db,ber\n1\n", "line 2: has not as many fields as the header"),
        ("ebn0_db,ber\n#\n1,2\n", "line 3: 2 is not an error rate on a logarithmic axis; give a number above 0"),
        ("ebn0_db,block_errors,blocks\n1,2,x\n", "line 2: 'x' is not a count"),
        ("ebn0_db,block_errors,blocks\n1,2,1\n", "line 2: 2 is not a count of errors in 1"),
        ("ebn0_db,ber\n", "holds no point"),
    ],
)
def test_refuses_references_that_are_not_well_formed(results, tmp_path, content, text):
    file = tmp_path / "theirs.csv"
    file.write_text(content)
    with pytest.raises(ValueError, match=text):
        quarzel.plot(results, references=[file])


def test_labels_tell_coded_links_as_the_tool_does(tool, tmp_path):
    link = {"code_rate": [0.5], "modulation": ["qpsk", "16qam"], "max_blocks": 50}
    quarzel.sweep([0.0], transport_block=90, **link).save(tmp_path / "a.json")
    quarzel.sweep([0.0], block_size=104, **link).save(tmp_path / "b.json")
    files = [tmp_path / "a.json", tmp_path / "b.json"]
    rows = rows_of(tool, tmp_path, *files, "--x", "esn0", "--panel", "bler")
    (axes,) = quarzel.plot([quarzel.SweepResult.read(file) for file in files], x="esn0", panel="bler").axes
    points = {container.get_label(): container[0].get_data()[0][0] for container in axes.containers}
    assert points.keys() == {row["curve"] for row in rows}
    assert "A = 90, 180 coded bits, qpsk" in points
    for row in rows:
        assert points[row["curve"]] == pytest.approx(float(row["esn0_db"]), abs=1e-7)


def test_axes_end_where_they_are_told(results):
    figure = quarzel.plot(results, x_range=(-1, 2), y_range=(1e-4, 0.5), uncoded=True)
    for axes in figure.axes:
        assert (axes.get_xlim(), axes.get_ylim()) == ((-1, 2), (1e-4, 0.5))
        uncoded = dict(lines_of(axes)["uncoded BPSK"])
        share = 0.0786496035251425  # of wrong bits at 0 dB
        expected = share if axes is figure.axes[0] else 1 - (1 - share) ** 40
        assert np.interp(0, list(uncoded), list(uncoded.values())) == pytest.approx(expected, rel=1e-3)


def test_refuses_iterations_that_cannot_be_drawn(results):
    with pytest.raises(ValueError, match="there are 2 curves; give one of SweepResult.curves"):
        quarzel.plot(results, per_iteration=True)
    with pytest.raises(ValueError, match="no error rates per iteration; make it with sweep"):
        quarzel.plot(results[0].curves[0], per_iteration=True)
    (curve,) = quarzel.sweep([0.0], block_size=40, iterations=2, max_blocks=8, per_iteration=True).curves
    with pytest.raises(ValueError, match="iterations must be a number from 1 to 2, not 3"):
        quarzel.plot(curve, per_iteration=True, iterations=3)


@pytest.mark.parametrize(
    "arguments, text",
    [
        ({"x_range": (1, 0)}, "x_range must be two numbers in ascending order"),
        ({"y_range": (0, 1)}, "y_range must be above 0"),
        ({"block_size": 48}, "there is no curve"),
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
