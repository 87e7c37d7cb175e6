// SPDX-License-Identifier: MIT
#pragma once

#include <svdpi.h>

#include <cstddef>
#include <cstdint>
#include <vector>

namespace quarzel::dpi {

/// The soft values that four-state words of 32 bits hold.
/// @param words  one a position
/// @param name   of the stream
/// @throws BindingError naming the first position where a bit is x or z
std::vector<std::int32_t> knownValues(const svLogicVecVal* words, std::size_t positions, const char* name);

}  // namespace quarzel::dpi
