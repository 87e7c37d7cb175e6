// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "link/encoder.hpp"

namespace quarzel::link {

/// Encode a code block with filler bits (3GPP TS 36.212, section 5.1.3.2): they count as 0, and where they
/// are the systematic and the first parity bits are <NULL>. Pure; the inverse is a core.
/// @param encoder  of the block's size, K
/// @param block    K values, bits of 0 or 1; the first `filler` ones may be anything
/// @param filler   F
/// @param streams  receives 3 (K + 4) values, as the encoder orders them: bits, and nullBit
/// @throws std::invalid_argument when a size does not fit
void turboEncode(const Encoder& encoder, std::span<const std::uint8_t> block, std::size_t filler,
                 std::span<std::uint8_t> streams);

/// Refuse more filler bits than a block can have beside one of its own.
/// @throws std::invalid_argument that names how many fit
void requireFiller(std::size_t filler, std::size_t K);

}  // namespace quarzel::link
