# SPDX-License-Identifier: MIT
"""The package and a program that uses it pass a strict type checker."""

import os
import subprocess
import sys
from pathlib import Path

import quarzel


def test_the_package_and_its_user_are_strictly_typed(tmp_path):
    here = Path(__file__).parent
    package = Path(quarzel.__file__).parent
    checked = subprocess.run(
        [sys.executable, "-m", "mypy", "--strict", "--cache-dir", tmp_path, package, here / "typed_user.py"],
        cwd=tmp_path, env={**os.environ, "MYPYPATH": str(package.parent)}, capture_output=True, text=True,
    )  # fmt: skip
    assert checked.returncode == 0, checked.stdout + checked.stderr
