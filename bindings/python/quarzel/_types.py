# SPDX-License-Identifier: MIT
"""The settings of a core, for type checkers."""

from typing import Literal, Union

Algorithm = Literal["max-log", "scaled-max-log", "max-star"]
"""The name of an arithmetic of the core."""
AlgorithmOrNumber = Union[Algorithm, Literal[0, 1, 2]]
Units = Literal[2, 4, 8]
"""Processing units of a core."""
