// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

/// Modulo arithmetic on the core's left-aligned 16-bit metrics, one operation for each thing that the trellis
/// steps do. A word with lanes offers the same names, so that one text of a step serves both.
namespace quarzel {

/// A 32-bit value kept to its low 16 bits, as a signed word.
constexpr std::int16_t wrap16(std::int32_t value) {
    return static_cast<std::int16_t>(value);
}

/// x + y modulo 2^16.
constexpr std::int16_t add(std::int16_t x, std::int16_t y) {
    return wrap16(x + y);
}

/// x - y modulo 2^16.
constexpr std::int16_t sub(std::int16_t x, std::int16_t y) {
    return wrap16(x - y);
}

/// y where the difference is negative, else x.
constexpr std::int16_t chooseBySign(std::int16_t difference, std::int16_t x, std::int16_t y) {
    return difference < 0 ? y : x;
}

/// The modulo maximum: the larger of two metrics by the sign of their wrapped difference. A tie keeps
/// x. The order of the arguments matters at a difference of exactly -2^15, where either order chooses its
/// second.
template <class Word>
constexpr Word moduloMax(Word x, Word y) {
    return chooseBySign(sub(x, y), x, y);
}

/// Boundary metrics between segments are kept with their low 7 bits cleared.
constexpr std::int16_t boundaryMask = -128;

}  // namespace quarzel
