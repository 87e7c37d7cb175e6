// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>

#include "vectors/decision_comparison.hpp"

namespace quarzel::tool {

/// What alone could make decisions differ as they do.
struct DecisionHint {
    std::string kind;  ///< inverted, reversed, shifted or swapped
    std::string text;  ///< for people, one line
};

/// Find out whether the decisions that differ are those expected in another form: inverted, in reversed order
/// within a block or within groups of 8, 16 or 32 bits, shifted by up to 64 bits in their block or from the
/// first difference on, or those of other blocks. There have to be 8 wrong bits or more. A hint explains half
/// of them at least, the rest being where a shift brings nothing, and is denied by few bits. Those that are
/// x, z or missing do not count.
std::optional<DecisionHint> hintOf(const ExpectedDecisions& expected, const MemoryImage& actual,
                                   const DecisionComparison& comparison);

}  // namespace quarzel::tool
