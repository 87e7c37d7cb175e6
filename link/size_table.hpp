// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "quarzel/code.hpp"

/// Look-ups among the block sizes, and messages for those who give another number.
namespace quarzel::link {

/// The size of blocks with this many positions, K + 4, in each stream; none when there is no such size.
std::optional<BlockSize> findPositions(std::uint64_t positions);

/// The valid block sizes next to one that is not valid, in ascending order: one on each side, or only one
/// when K lies outside the table.
std::vector<std::uint32_t> nearestBlockSizes(std::uint64_t K);

/// The same as a text: "40, 48".
std::string nearestBlockSizesText(std::uint64_t K);

/// The block size itself.
/// @throws std::invalid_argument naming the nearest sizes when there is no such size
std::uint32_t checkedBlockSize(std::uint32_t K);

/// The valid numbers of positions next to one that is not valid: "44 (K = 40), 52 (K = 48)".
std::string nearestPositionsText(std::uint64_t positions);

}  // namespace quarzel::link
