// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <span>

#include "link/coding/rate_matching.hpp"

/// Rate matching undone on soft values, which are positive for bit 1: the inverse of 3GPP TS 36.212, section
/// 5.1.4.1. All functions are pure, but for what they write.
///
/// A soft buffer holds a value for each code bit that a RateMatching has, in its order. One that is all 0 has
/// received nothing.
namespace quarzel::link {

/// The soft value of a filler bit: the strongest 0 that the core's inputs can hold.
inline constexpr std::int8_t fillerSoft = -128;

/// The bits of a soft buffer's values that a core takes as they are.
inline constexpr unsigned coreWidth = 8;

/// Add the soft values of a transmission to a soft buffer, one after another, each sum clipped.
/// @param soft    E values
/// @param buffer  of earlier transmissions of the same block, or all 0
/// @param width   bits of a value in the buffer, 2 to 16: it is clipped to -2^(width-1) .. 2^(width-1) - 1
/// @throws std::invalid_argument when E is 0, the redundancy version is not 0 to 3, the width is not 2 to 16,
///         or the buffer is not of this block's size
void rateRecover(const RateMatching& matching, unsigned rv, std::span<const std::int16_t> soft,
                 std::span<std::int16_t> buffer, unsigned width = coreWidth);
void rateRecover(const RateMatching& matching, unsigned rv, std::span<const std::int8_t> soft,
                 std::span<std::int16_t> buffer, unsigned width = coreWidth);

/// The three streams that a core takes, from a soft buffer.
/// @param streams  receives 3 (K + 4) values: those of the buffer, clipped to 8 bits; fillerSoft for the
///                 systematic and first parity value of filler bits; 0 for what the buffer does not have
/// @throws std::invalid_argument when a size does not fit
void readStreams(const RateMatching& matching, std::span<const std::int16_t> buffer,
                 std::span<std::int8_t> streams);

/// A soft buffer from the entries of w: N_cb values, of which those at dummies and filler bits do not matter.
/// @throws std::invalid_argument when a size does not fit
void readEntries(const RateMatching& matching, std::span<const std::int16_t> entries,
                 std::span<std::int16_t> buffer);

/// A soft buffer as the entries of w: N_cb values, 0 at dummies and filler bits.
/// @throws std::invalid_argument when a size does not fit
void writeEntries(const RateMatching& matching, std::span<const std::int16_t> buffer,
                  std::span<std::int16_t> entries);

}  // namespace quarzel::link
