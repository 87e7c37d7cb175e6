// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "link/channel/channel.hpp"

namespace quarzel::link {

/// The soft values of the bits of a component, the first bit first.
using PamSoft = std::array<std::int8_t, 4>;

/// A component of a symbol over additive white Gaussian noise as a discrete channel: the received value is
/// cut where one of the quantised soft values changes. Every step is correctly rounded to 128 bits.
struct PamTable {
    std::vector<PamSoft> soft;  ///< of each piece, in ascending order of the received value
    /// For each amplitude, in the order of `amplitudes`, and each cut: 2^48 times the probability that the
    /// received value is below it, rounded to the nearest whole number.
    std::vector<std::vector<std::uint64_t>> thresholds;
};

PamTable makePamTable(const ChannelSetup& setup, Decibels ebN0, CodeRate rate);

}  // namespace quarzel::link
