// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <span>

/// The cyclic redundancy checks of 3GPP TS 36.212, section 5.1.1. Bits are bytes of 0 or 1, the first one the
/// highest power. All functions are pure.
namespace quarzel::link {

enum class Crc { crc24A, crc24B, crc16, crc8 };

/// L, the parity bits of a check.
unsigned crcLength(Crc crc);

/// The parity bits p_0 to p_(L-1) of some bits, as a number whose highest bit, of L, is p_0.
std::uint32_t crcOf(Crc crc, std::span<const std::uint8_t> bits);

/// The same as bits, for one block or for 8 blocks together: bit i of every byte belongs to block i.
/// @param parity  receives L bits of the same form
/// @throws std::invalid_argument when it is not of that size
void writeCrc(Crc crc, std::span<const std::uint8_t> bits, std::span<std::uint8_t> parity);

/// Whether bits that end with their parity bits leave no remainder.
bool crcHolds(Crc crc, std::span<const std::uint8_t> bits);

}  // namespace quarzel::link
