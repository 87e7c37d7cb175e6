# SPDX-License-Identifier: MIT
from typing import Any, Optional

import numpy as np
from numpy.typing import NDArray

from ._types import Algorithm

version: str
algorithms: tuple[Algorithm, ...]

class ModelWarning(UserWarning): ...

class Core:
    def __init__(self, units: int, algorithm: int, tag_width: int, implementation: str) -> None: ...
    @property
    def implementation(self) -> str: ...
    def decode(
        self,
        systematic: NDArray[Any],
        parity1: NDArray[Any],
        parity2: NDArray[Any],
        iterations: int,
        tags: Optional[NDArray[np.uint32]],
        every_iteration: bool,
    ) -> tuple[NDArray[np.uint8], NDArray[np.uint32]]: ...
    def decode_plain(
        self, systematic: object, parity1: object, parity2: object, iterations: object
    ) -> Optional[NDArray[np.uint8]]: ...
    def trace(
        self,
        systematic: NDArray[Any],
        parity1: NDArray[Any],
        parity2: NDArray[Any],
        iterations: int,
        passes: int,
    ) -> tuple[NDArray[np.uint8], int, NDArray[np.int16], dict[str, NDArray[np.int16]]]: ...
    def close(self) -> None: ...

def implementations() -> list[str]: ...
def encode(bits: NDArray[np.uint8]) -> NDArray[np.uint8]: ...
def block_sizes() -> list[int]: ...
def qpp(K: int) -> NDArray[np.int32]: ...
def layout(K: int, units: int) -> tuple[int, list[int]]: ...
def signals() -> list[tuple[str, int, int]]: ...
