// SPDX-License-Identifier: MIT
#pragma once

#include <compare>
#include <cstdint>

namespace quarzel::link {

/// A ratio in dB, in whole millionths: 0.1 dB is exactly that, wherever it comes from.
struct Decibels {
    std::int32_t micro = 0;

    /// The double nearest to it.
    double value() const { return micro / 1e6; }

    auto operator<=>(const Decibels&) const = default;
};

}  // namespace quarzel::link
