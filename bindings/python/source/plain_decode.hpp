// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/numpy.h>

#include "common/host_core.hpp"

namespace quarzel::python {

/// Decode what needs no conversion, which makes a call for a single block cheap: exact arrays of int8, int16
/// or int32 in the machine's byte order, (K + 4) or (blocks, K + 4) for each stream, or (3, K + 4) or
/// (blocks, 3, K + 4) with the parities None. The GIL is released meanwhile.
/// @param iterations  an exact int
/// @return            bits (K), or (blocks, K); None when the arguments are anything else, valid or not
pybind11::object decodePlain(bindings::HostCore& core, pybind11::handle systematic, pybind11::handle parity1,
                             pybind11::handle parity2, pybind11::handle iterations);

}  // namespace quarzel::python
