# SPDX-License-Identifier: MIT
from typing import Any, Optional

import numpy as np
from numpy.typing import NDArray

version: str
algorithms: tuple[str, ...]

class ModelWarning(UserWarning): ...

class Core:
    def __init__(self, units: int, algorithm: int, tag_width: int) -> None: ...
    def decode(
        self,
        systematic: NDArray[Any],
        parity1: NDArray[Any],
        parity2: NDArray[Any],
        iterations: int,
        tags: Optional[NDArray[np.uint32]],
    ) -> tuple[NDArray[np.uint8], NDArray[np.uint32]]: ...
    def trace(
        self,
        systematic: NDArray[Any],
        parity1: NDArray[Any],
        parity2: NDArray[Any],
        iterations: int,
        passes: int,
    ) -> tuple[NDArray[np.uint8], str]: ...
    def close(self) -> None: ...

def encode(bits: NDArray[np.uint8]) -> NDArray[np.uint8]: ...
def block_sizes() -> list[int]: ...
def qpp(K: int) -> NDArray[np.int32]: ...
def segments(K: int, units: int) -> tuple[NDArray[np.int32], NDArray[np.int32]]: ...
