// SPDX-License-Identifier: MIT
#include "options/block_sizes.hpp"

#include <fmt/format.h>

#include "tool_error.hpp"

namespace quarzel::tool {

const LteParams& blockSizeRow(std::uint64_t K, const std::string& subject) {
    if (const LteParams* row = link::findBlockSize(K)) {
        return *row;
    }
    throw ToolError(ExitCode::usage, subject, fmt::format("{} is no block size of LTE", K),
                    "the nearest: " + link::nearestBlockSizesText(K));
}

std::uint32_t blockSizeOf(std::uint64_t positions, const std::string& where) {
    if (const LteParams* row = link::findPositions(positions)) {
        return row->K;
    }
    throw fileError(where, fmt::format("blocks of {} positions fit no block size", positions),
                    "the nearest that do: " + link::nearestPositionsText(positions));
}

std::vector<BlockSizeRange> blockSizeRanges() {
    std::vector<BlockSizeRange> ranges = {{lteParams[0].K, lteParams[1].K, lteParams[1].K - lteParams[0].K}};
    for (std::size_t row = 2; row < lteParams.size(); ++row) {
        const std::uint32_t step = lteParams[row].K - lteParams[row - 1].K;
        if (step == ranges.back().step) {
            ranges.back().last = lteParams[row].K;
        } else {
            ranges.push_back({lteParams[row].K, lteParams[row].K, step});
        }
    }
    return ranges;
}

}  // namespace quarzel::tool
