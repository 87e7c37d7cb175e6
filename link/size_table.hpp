// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "interleaver/lte_params.hpp"

/// Look-ups in the table of block sizes, and what a user is told who has none of them.
namespace quarzel::link {

/// Positions of each stream after its K information bits: the tail.
inline constexpr std::uint32_t tailPositions = 4;

/// The row of the parameter table for a block size, or null when LTE has no such size.
const LteParams* findBlockSize(std::uint64_t K);

/// The row for blocks with this many positions, K + 4, in each stream, or null.
const LteParams* findPositions(std::uint64_t positions);

/// The valid block sizes next to one that is not valid, in ascending order: one on each side, or only one
/// when K lies outside the table.
std::vector<std::uint32_t> nearestBlockSizes(std::uint64_t K);

/// The same as a text: "40, 48".
std::string nearestBlockSizesText(std::uint64_t K);

/// The valid numbers of positions next to one that is not valid: "44 (K = 40), 52 (K = 48)".
std::string nearestPositionsText(std::uint64_t positions);

}  // namespace quarzel::link
