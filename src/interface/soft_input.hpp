// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "fixed/soft_value.hpp"
#include "interface/block_call.hpp"

/// From the caller's integers to the decoder's soft values: pure and silent.
namespace quarzel {

/// Where the first saturated value of a block stood.
struct Saturation {
    int position;
    std::size_t stream;  ///< 0 systematic, 1 first parity, 2 second parity
    bool positive;
};

/// A value of the caller's.
int valueAt(const BlockCall& call, std::size_t stream, int position);

/// Convert a block: position by position systematic, parity 1, parity 2.
///
/// @param soft  receives 3 * size words of the state format
void toSoftValues(const BlockCall& call, const TNumberFormat& input, const TNumberFormat& state,
                  std::vector<short>& soft);

/// The first value of a block that the conversion saturates, in position order.
std::optional<Saturation> findSaturation(const BlockCall& call, const TNumberFormat& input);

}  // namespace quarzel
