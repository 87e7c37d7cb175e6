// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <compare>
#include <cstdint>

#include "link/decibels.hpp"
#include "quarzel/quantise.hpp"

namespace quarzel::link {

/// How a received value becomes a soft value of the core: rounded to the nearest whole number, then clipped
/// to -128..127.
struct Quantiser {
    enum class Kind {
        amplitude,  ///< scale * y: `scale` units for the amplitude 1 that is sent
        llr,        ///< scale * 2 y / sigma^2: `scale` units for a log-likelihood ratio of 1
    };
    Kind kind = Kind::llr;
    double scale = llrScale;  ///< above 0, at most highestScale

    static constexpr double highestScale = 1e6;

    auto operator<=>(const Quantiser&) const = default;
};

/// The bits of a random number that decides a channel output.
constexpr unsigned channelBits = 48;

/// Outputs before clipping that can be told apart, for a code bit of 1: -128 (and less) to 128 (and more).
constexpr int lowestOutput = -128;
constexpr int highestOutput = 128;

/// Entry i is 2^48 times the probability that the output for a code bit of 1 is below i - 127, rounded to the
/// nearest whole number.
using ChannelThresholds = std::array<std::uint64_t, highestOutput - lowestOutput>;

/// The code rate, by which the energy of an information bit is shared out among the coded bits.
struct CodeRate {
    std::uint32_t informationBits = 1;
    std::uint32_t codedBits = 3;

    bool operator==(const CodeRate&) const = default;
};

/// The variance of the noise, 1 / (2 R Eb/N0) at an amplitude of 1.
double noiseVariance(Decibels ebN0, CodeRate rate = {});

/// The thresholds of a channel: bit 1 is sent as +1, bit 0 as -1, noise of that variance is added, the sum
/// is quantised. Every step is correctly rounded to 128 bits, so they are the same on every machine.
ChannelThresholds channelThresholds(const Quantiser& quantiser, Decibels ebN0, CodeRate rate = {});

}  // namespace quarzel::link
