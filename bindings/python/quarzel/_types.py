# SPDX-License-Identifier: MIT
"""The settings of a core and the choices of the coding chain, for type checkers."""

from typing import Literal, Union

Algorithm = Literal["max-log", "scaled-max-log", "max-star"]
"""The name of an arithmetic of the core."""
AlgorithmOrNumber = Union[Algorithm, Literal[0, 1, 2]]
Units = Literal[2, 4, 8]
"""Processing units of a core."""
Scheme = Literal["bpsk", "qpsk", "16qam", "64qam", "256qam"]
"""The name of a modulation."""
RedundancyVersion = Literal[0, 1, 2, 3]
"""What a transmission of a block begins with."""
DemodulationMethod = Literal["maxlog", "exact"]
"""How log-likelihood ratios are computed."""
