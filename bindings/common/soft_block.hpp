// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <vector>

namespace quarzel::bindings {

/// How a host holds soft values.
enum class SoftType { int8, int16, int32, float64 };

/// One code block as a host holds it. Positive means bit 1, the unit is 1/8.
struct SoftBlock {
    std::array<const void*, 3> streams;  ///< systematic, parity 1, parity 2; `positions` values each
    SoftType type;                       ///< of all three
    std::size_t positions;               ///< K + 4
    unsigned char* bits;                 ///< receives K decisions, 0 or 1 a byte
    unsigned tag = 0;                    ///< comes back masked to the tag width
};

/// Append the values of a stream to ints, which the model takes.
/// @throws BindingError when a float64 is no whole number that an int holds
void widen(const void* values, SoftType type, std::size_t count, std::vector<int>& ints);

}  // namespace quarzel::bindings
