// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "vectors/decision_comparison.hpp"

namespace quarzel::tool {

/// Blocks that have something in common.
struct BlockGroup {
    std::string name;
    std::size_t blocks = 0;
    std::size_t differing = 0;
};

/// The blocks grouped by one of their properties, in the order in which groups first appear.
struct Grouping {
    std::string property;  ///< K, iterations or stimulus
    std::vector<BlockGroup> groups;
};

/// The groupings of blocks by what is known of them. Blocks of a link are grouped by transmission and code
/// block.
std::vector<Grouping> groupingsOf(const ExpectedDecisions& expected, const DecisionComparison& comparison);

}  // namespace quarzel::tool
