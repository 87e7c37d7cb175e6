// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

namespace quarzel::test {

/// From the caller's integers to words.
struct Conversions {
    /// @param saturated  for each `width` values whether one of them was saturated
    template <class Value>
    using Convert = void (*)(const Value* values, std::int16_t* words, bool* saturated, std::size_t count);

    std::size_t width;
    Convert<std::int8_t> fromInt8;
    Convert<std::int16_t> fromInt16;
    Convert<std::int32_t> fromInt32;
};

/// The words' operations of one instruction set, over arrays of a multiple of 32 values.
struct LaneProbe {
    void (*staircase)(const std::int16_t* difference, std::int16_t* correction, std::size_t count);
    void (*halfExtrinsic[2])(const std::int16_t* llr, const std::int16_t* channel, std::int16_t* half,
                             std::size_t count);  ///< [0] plain, [1] scaled
    void (*moduloMax)(const std::int16_t* x, const std::int16_t* y, std::int16_t* larger, std::size_t count);
    /// Eight values at a time, and as many as the instruction set reads at once.
    Conversions toWords[2];
};

}  // namespace quarzel::test
