// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "link/size_table.hpp"
#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// The block size that the user gave.
/// @param subject  the argument or option that he gave it with
/// @throws ToolError naming the nearest valid ones when LTE has no such size
BlockSize knownBlockSize(std::uint64_t K, const std::string& subject);

/// A check that a text is a whole number or "all", the word for all block sizes.
CLI::Validator blockSizeOrAll();

/// The block sizes that the user gave, of texts that have passed this check.
/// @param subject  as in `knownBlockSize`
/// @throws ToolError as there
std::vector<std::uint32_t> blockSizesOf(const std::vector<std::string>& texts, const std::string& subject);

/// The block size K whose blocks have this many positions, K + 4, in each stream.
/// @param where  the file, and the line when it is known, for the error message
/// @throws ToolError naming the nearest valid numbers when no K fits
std::uint32_t blockSizeOf(std::uint64_t positions, const std::string& where);

/// Equally spaced block sizes.
struct BlockSizeRange {
    std::uint32_t first;
    std::uint32_t last;
    std::uint32_t step;
};

/// The valid block sizes as ranges, in ascending order.
std::vector<BlockSizeRange> blockSizeRanges();

}  // namespace quarzel::tool
