// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

#include "fixed/number_format.hpp"

namespace quarzel {

/// Saturate a value to the input format and bring it into the state format.
///
/// @param value       in units of the input format
/// @param saturated   set to +1 or -1 when the value was saturated, else to 0
/// @return            a word of the state format
///
/// The comparison is made on the shifted 32-bit value: bits shifted out are lost, so that a magnitude of 2^23
/// (at a shift of 8) or more wraps first, as the core's own input conversion does.
constexpr short toSoftValue(int value, const TNumberFormat& input, const TNumberFormat& state,
                            int& saturated) {
    auto word = static_cast<std::int32_t>(static_cast<std::uint32_t>(value) << input.shift);
    saturated = word > input.max ? 1 : word < input.min ? -1 : 0;
    if (saturated != 0) {
        word = saturated > 0 ? input.max : input.min;
    }
    const std::int32_t q = word >> input.shift;
    if (q < state.minQ) {
        return state.min;
    }
    return q > state.maxQ ? state.max : state.toWord(q);
}

}  // namespace quarzel
