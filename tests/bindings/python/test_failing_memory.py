# SPDX-License-Identifier: MIT
"""Where memory runs out, a call raises MemoryError or does its work, and the next one is good."""

import os
import subprocess
import sys
from pathlib import Path

import quarzel


def test_each_allocation_may_fail(tmp_path):
    environment = {
        "LD_PRELOAD": os.environ["QUARZEL_FAILING_CALLS"],
        "QUARZEL_FAILING_IN": f"{Path(quarzel.__file__).parent}/_",
        "QUARZEL_FAILED": str(tmp_path / "failed"),
    }
    run = subprocess.run(
        [sys.executable, "-B", Path(__file__).with_name("failing_memory.py")],
        env=os.environ | environment,
        capture_output=True,
        text=True,
        check=False,
    )
    assert (run.returncode, run.stderr) == (0, "")
    failures = {name: int(count) for name, count in (line.rsplit(" ", 1) for line in run.stdout.splitlines())}
    assert len(failures) == 8
    assert all(count > 5 for count in failures.values()), failures
