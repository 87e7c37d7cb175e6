// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/numpy.h>

#include <cstdint>
#include <optional>
#include <tuple>

#include "common/core.hpp"

namespace quarzel::python {

using Bytes = pybind11::array_t<std::uint8_t, pybind11::array::c_style>;
using Tags = pybind11::array_t<std::uint32_t, pybind11::array::c_style>;

/// Decode blocks of one size. The GIL is released meanwhile.
/// @param systematic  (blocks, K + 4) of int8, int16 or int32, values of a row after one another; so are
///                    the parities
/// @param tags        one a block
/// @return            bits (blocks, K) and tags (blocks)
std::tuple<Bytes, Tags> decodeArrays(bindings::Core& core, const pybind11::array& systematic,
                                     const pybind11::array& parity1, const pybind11::array& parity2,
                                     int iterations, const std::optional<Tags>& tags);

/// Decode one block with a trace of its first passes.
/// @param systematic  (1, K + 4), as above
/// @return            bits (1, K) and the text of the trace
std::tuple<Bytes, std::string> traceArrays(bindings::Core& core, const pybind11::array& systematic,
                                           const pybind11::array& parity1, const pybind11::array& parity2,
                                           int iterations, unsigned passes);

}  // namespace quarzel::python
