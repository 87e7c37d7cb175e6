// SPDX-License-Identifier: MIT
#include "options/block_sizes.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>

#include "options/whole_number.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

BlockSize knownBlockSize(std::uint64_t K, const std::string& subject) {
    if (const auto size = findBlockSize(K)) {
        return *size;
    }
    throw ToolError(ExitCode::usage, subject, fmt::format("{} is not a block size of LTE", K),
                    "the nearest: " + link::nearestBlockSizesText(K));
}

CLI::Validator blockSizeOrAll() {
    const CLI::Validator number = wholeNumber([](std::uint64_t) { return true; }, "a whole number");
    return {[number](std::string& text) { return text == "all" ? std::string() : number(text); }, ""};
}

std::vector<std::uint32_t> blockSizesOf(const std::vector<std::string>& texts, const std::string& subject) {
    std::vector<std::uint32_t> sizes;
    if (std::find(texts.begin(), texts.end(), "all") != texts.end()) {
        for (const BlockSize& size : blockSizes()) {
            sizes.push_back(size.K);
        }
        return sizes;
    }
    for (const std::string& text : texts) {
        sizes.push_back(knownBlockSize(readWholeNumber(text).value(), subject).K);
    }
    return sizes;
}

std::uint32_t blockSizeOf(std::uint64_t positions, const std::string& where) {
    if (const auto size = link::findPositions(positions)) {
        return size->K;
    }
    throw fileError(where, fmt::format("blocks of {} positions fit no block size", positions),
                    "the nearest that do: " + link::nearestPositionsText(positions));
}

std::vector<BlockSizeRange> blockSizeRanges() {
    const std::vector<BlockSize> sizes = blockSizes();
    std::vector<BlockSizeRange> ranges = {{sizes[0].K, sizes[1].K, sizes[1].K - sizes[0].K}};
    for (std::size_t i = 2; i < sizes.size(); ++i) {
        const std::uint32_t step = sizes[i].K - sizes[i - 1].K;
        if (step == ranges.back().step) {
            ranges.back().last = sizes[i].K;
        } else {
            ranges.push_back({sizes[i].K, sizes[i].K, step});
        }
    }
    return ranges;
}

}  // namespace quarzel::tool
