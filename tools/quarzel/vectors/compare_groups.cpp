// SPDX-License-Identifier: MIT
#include "vectors/compare_groups.hpp"

#include <unordered_map>

namespace quarzel::tool {

namespace {

std::string sizeOf(const ExpectedBlock& block) {
    return std::to_string(block.blockSize);
}

std::string iterationsOf(const ExpectedBlock& block) {
    return block.iterations == 0 ? "" : std::to_string(block.iterations);
}

/// The stimulus without the block of a link that it names first.
std::string stimulusOf(const ExpectedBlock& block) {
    const std::size_t comma = block.stimulus.find(", ");
    return comma == std::string::npos ? block.stimulus : block.stimulus.substr(comma + 2);
}

/// @param nameOf  the name of a block's group; empty: nothing is known
Grouping groupingOf(const ExpectedDecisions& expected, const DecisionComparison& comparison,
                    const char* property, std::string (*nameOf)(const ExpectedBlock&)) {
    Grouping grouping{property, {}};
    std::unordered_map<std::string, std::size_t> places;
    const auto groupOf = [&](const ExpectedBlock& block) -> BlockGroup& {
        const auto [place, isNew] = places.emplace(nameOf(block), grouping.groups.size());
        if (isNew) {
            grouping.groups.push_back({place->first});
        }
        return grouping.groups[place->second];
    };
    for (const ExpectedBlock& block : expected.blocks) {
        ++groupOf(block).blocks;
    }
    for (const BlockDifference& difference : comparison.failing) {
        ++groupOf(expected.blocks[difference.block]).differing;
    }
    return grouping;
}

}  // namespace

std::vector<Grouping> groupingsOf(const ExpectedDecisions& expected, const DecisionComparison& comparison) {
    std::vector<Grouping> groupings = {groupingOf(expected, comparison, "K", sizeOf),
                                       groupingOf(expected, comparison, "iterations", iterationsOf),
                                       groupingOf(expected, comparison, "stimulus", stimulusOf)};
    std::erase_if(groupings, [](const Grouping& grouping) {
        return grouping.groups.empty() || grouping.groups.front().name.empty();
    });
    return groupings;
}

}  // namespace quarzel::tool
