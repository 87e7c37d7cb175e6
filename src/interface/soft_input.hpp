// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "fixed/number_format.hpp"
#include "vardel_ip_quarzel.h"

/// From the caller's integers to the decoder's soft values: pure and silent.
namespace quarzel {

/// Where the first saturated value of a block stood.
struct Saturation {
    int position;
    std::size_t stream;  ///< 0 systematic, 1 first parity, 2 second parity
    bool positive;
};

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

/// Convert a block: position by position systematic, parity 1, parity 2.
///
/// @param soft  receives 3 * din_size words of the state format
void toSoftValues(const vardel_ip_quarzel_inputs& inputs, const TNumberFormat& input,
                  const TNumberFormat& state, std::vector<short>& soft);

/// The first value of a block that the conversion saturates, in position order.
std::optional<Saturation> findSaturation(const vardel_ip_quarzel_inputs& inputs, const TNumberFormat& input);

}  // namespace quarzel
