// SPDX-License-Identifier: MIT
#include "block_sizes.hpp"

#include <fmt/format.h>

#include <algorithm>

#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr std::uint32_t tailPositions = 4;

/// The first row whose block size is K or more.
auto atLeast(std::uint64_t K) {
    return std::lower_bound(lteParams.begin(), lteParams.end(), K,
                            [](const LteParams& row, std::uint64_t size) { return row.K < size; });
}

}  // namespace

const LteParams* findBlockSize(std::uint64_t K) {
    const auto row = atLeast(K);
    return row != lteParams.end() && row->K == K ? &*row : nullptr;
}

std::vector<std::uint32_t> nearestBlockSizes(std::uint64_t K) {
    const auto above = atLeast(K);
    std::vector<std::uint32_t> sizes;
    if (above != lteParams.begin()) {
        sizes.push_back((above - 1)->K);
    }
    if (above != lteParams.end()) {
        sizes.push_back(above->K);
    }
    return sizes;
}

const LteParams& blockSizeRow(std::uint64_t K, const std::string& subject) {
    if (const LteParams* row = findBlockSize(K)) {
        return *row;
    }
    throw ToolError(ExitCode::usage, subject, fmt::format("{} is no block size of LTE", K),
                    fmt::format("the nearest: {}", fmt::join(nearestBlockSizes(K), ", ")));
}

std::uint32_t blockSizeOf(std::uint64_t positions, const std::string& where) {
    const std::uint64_t K = positions < tailPositions ? 0 : positions - tailPositions;
    if (const LteParams* row = findBlockSize(K)) {
        return row->K;
    }
    std::vector<std::string> nearest;
    for (const std::uint32_t size : nearestBlockSizes(K)) {
        nearest.push_back(fmt::format("{} (K = {})", size + tailPositions, size));
    }
    throw fileError(where, fmt::format("blocks of {} positions fit no block size", positions),
                    fmt::format("the nearest that do: {}", fmt::join(nearest, ", ")));
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
