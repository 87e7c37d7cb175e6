# SPDX-License-Identifier: MIT
"""Every public function has an example in its docstring, and the examples do what they show."""

import doctest
import importlib.util
import inspect
import os

import numpy as np
import pytest

import quarzel

NEEDS = {"plot": "matplotlib", "SweepResult.plot": "matplotlib", "SweepResult.to_dataframe": "pandas"}


def documented():
    """The names of the public functions, of classes with a life of their own, and of their methods."""
    for name in quarzel.__all__:
        thing = getattr(quarzel, name)
        if inspect.isfunction(thing) or thing in (quarzel.Decoder, quarzel.Scoreboard, quarzel.SweepResult):
            yield name, thing
        if inspect.isclass(thing) and thing not in (quarzel.ModelWarning, quarzel.Segments):
            for method, code in vars(thing).items():
                if not method.startswith("_") and (inspect.isfunction(code) or isinstance(code, classmethod)):
                    yield f"{name}.{method}", getattr(thing, method)
    for name in quarzel.lte.__all__:
        if inspect.isfunction(getattr(quarzel.lte, name)):
            yield f"lte.{name}", getattr(quarzel.lte, name)


@pytest.mark.parametrize("name, thing", documented(), ids=[name for name, _ in documented()])
def test_the_example_does_what_it_shows(name, thing, tmp_path, monkeypatch):
    text = inspect.getdoc(thing)
    example = doctest.DocTestParser().get_doctest(text, {"np": np, "quarzel": quarzel}, name, None, 0)
    assert example.examples, f"{name} shows no example"
    if "sweep(" in text and os.environ["QUARZEL_SWEEP"] != "ON":
        pytest.skip("this build has no sweeps")
    if name in NEEDS and not importlib.util.find_spec(NEEDS[name]):
        pytest.skip(f"{NEEDS[name]} is not installed")
    monkeypatch.chdir(tmp_path)
    said = []
    results = doctest.DocTestRunner().run(example, out=said.append)
    assert results.failed == 0, "".join(said)
