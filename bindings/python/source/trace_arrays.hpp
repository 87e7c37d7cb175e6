// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/numpy.h>

#include "common/host_core.hpp"

namespace quarzel::python {

/// Decode one block and keep the signals of its first passes, as int16 in units of 1/8.
/// @param systematic  (1, K + 4), as for arrayBlocks
/// @param passes      how many, at least 1
/// @return            bits (1, K); blocks that the core decoded before; inputs (2, 3, K + 3) by constituent
///                    code and stream; and a dictionary of arrays by the names of signals: (passes, K + 3),
///                    or (passes, K + 3, width) for signals of more than one value a step
pybind11::tuple traceArrays(bindings::HostCore& core, const pybind11::array& systematic,
                            const pybind11::array& parity1, const pybind11::array& parity2, int iterations,
                            unsigned passes);

}  // namespace quarzel::python
