// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>

namespace quarzel::tool {

/// What the soft values of a block are.
enum class Stimulus : std::uint8_t {
    noise,         ///< a code word of random bits over the noisy channel
    zero,          ///< 0 everywhere
    fullScale,     ///< a code word of random bits at the ends of the range
    ties,          ///< 1.0 with random signs, no code word: metrics that are equal, and many of them
    saturating,    ///< the ends of the range with random signs, no code word
    firstSegment,  ///< a code word with noise in the first thread segment alone
    lastSegment,   ///< a code word with noise in the last thread segment and the tail alone
};

constexpr std::array<const char*, 7> stimulusNames = {"noise",      "zero",          "full-scale",  "ties",
                                                      "saturating", "first-segment", "last-segment"};

constexpr const char* nameOf(Stimulus stimulus) {
    return stimulusNames[static_cast<std::size_t>(stimulus)];
}

}  // namespace quarzel::tool
