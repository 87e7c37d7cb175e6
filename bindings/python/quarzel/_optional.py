# SPDX-License-Identifier: MIT
"""Modules that only a few functions need."""

from __future__ import annotations

import importlib
from typing import Any


def optional_module(name: str, needs: str) -> Any:
    """A module, or an error that says what needs it.

    :raises ImportError: it is not installed
    """
    try:
        return importlib.import_module(name)
    except ImportError as error:
        raise ImportError(needs) from error


def sweep_extension() -> Any:
    """The engine of sweeps, which is a part of its own: decoding does without.

    :raises ImportError: this build or this machine lacks it
    """
    try:
        return importlib.import_module("._sweep", __package__)
    except ModuleNotFoundError as error:
        raise ImportError(
            "this build of quarzel has no sweeps; build it with -DQUARZEL_SWEEP=ON where fmt, MPFR, nlohmann_json, "
            "OpenSSL and Random123 are installed"
        ) from error
    except ImportError as error:
        raise ImportError(f"sweeps need a library that is not installed: {error}") from error
