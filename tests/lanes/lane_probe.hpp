// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

namespace quarzel::test {

/// The words' operations of one instruction set, over arrays of a multiple of 32 values.
struct LaneProbe {
    void (*staircase)(const std::int16_t* difference, std::int16_t* correction, std::size_t count);
    void (*halfExtrinsic[2])(const std::int16_t* llr, const std::int16_t* channel, std::int16_t* half,
                             std::size_t count);  ///< [0] plain, [1] scaled
    void (*moduloMax)(const std::int16_t* x, const std::int16_t* y, std::int16_t* larger, std::size_t count);
    /// @param saturated  for each eight values whether one of them was saturated
    void (*toWords)(const int* values, std::int16_t* words, bool* saturated, std::size_t count);
};

}  // namespace quarzel::test
