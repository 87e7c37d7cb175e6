// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/numpy.h>

#include <cstdint>
#include <optional>
#include <span>
#include <tuple>

#include "common/host_core.hpp"

namespace quarzel::python {

using Bytes = pybind11::array_t<std::uint8_t, pybind11::array::c_style>;
using Tags = pybind11::array_t<std::uint32_t, pybind11::array::c_style>;

/// The blocks of three arrays.
/// @param systematic  (blocks, K + 4) of int8, int16 or int32 in the machine's byte order; the parities have
///                    the same type, shape and strides
/// @throws bindings::BindingError when they do not
bindings::ArrayBlocks arrayBlocks(const pybind11::array& systematic, const pybind11::array& parity1,
                                  const pybind11::array& parity2);

/// Decode blocks into an array that is there. The GIL is released meanwhile.
/// @param bits  (blocks, K), or (blocks, iterations, K)
/// @param tags  one for each block, comes back masked; may be empty
/// @throws pybind11::error_already_set when the core refuses, the user interrupts or has made warnings errors
void decodeInto(bindings::HostCore& core, const bindings::ArrayBlocks& blocks, int iterations, Bytes& bits,
                std::span<unsigned> tags, bool everyIteration);

/// Decode blocks of one size, as for arrayBlocks. The GIL is released meanwhile.
/// @param tags             one for each block
/// @param every_iteration  give the decisions after every iteration
/// @return                 bits (blocks, K), or (blocks, iterations, K), and tags (blocks)
std::tuple<Bytes, Tags> decodeArrays(bindings::HostCore& core, const pybind11::array& systematic,
                                     const pybind11::array& parity1, const pybind11::array& parity2,
                                     int iterations, const std::optional<Tags>& tags, bool everyIteration);

}  // namespace quarzel::python
