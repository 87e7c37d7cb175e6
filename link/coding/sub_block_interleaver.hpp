// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

/// The sub-block interleaver of rate matching (3GPP TS 36.212, section 5.1.4.1.1). All functions are pure.
namespace quarzel::link {

/// C_subblock, the columns of its matrix.
inline constexpr std::size_t subBlockColumns = 32;

/// R_subblock, the rows that D values need.
constexpr std::size_t subBlockRows(std::size_t D) {
    return (D + subBlockColumns - 1) / subBlockColumns;
}

/// What stands for a dummy in a sub-block interleaving.
inline constexpr std::uint16_t dummyPosition = 0xffff;

/// Which of its D values a stream gives at each place of the interleaved one, or dummyPosition: 32 R entries.
/// @param D       values of a stream, at most 6148
/// @param stream  0 systematic, 1 first parity, 2 second parity, which has a rule of its own
/// @throws std::invalid_argument for any other
std::vector<std::uint16_t> subBlockInterleaving(std::size_t D, unsigned stream);

/// Interleave a stream.
/// @param values       D bits
/// @param interleaved  receives 32 R values: bits, and nullBit at dummies
void subBlockInterleave(std::span<const std::uint8_t> values, unsigned stream,
                        std::span<std::uint8_t> interleaved);

/// Put the soft values of a stream back into order; those at dummies do not matter.
void subBlockDeinterleave(std::span<const std::int16_t> interleaved, unsigned stream,
                          std::span<std::int16_t> values);

}  // namespace quarzel::link
