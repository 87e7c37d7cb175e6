// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <ostream>
#include <string>

#include "vectors/decision_comparison.hpp"
#include "vectors/decision_hint.hpp"

namespace quarzel::tool {

/// What `quarzel compare` tells.
struct CompareReport {
    const ExpectedDecisions& expected;
    std::string actualName;
    const MemoryImage& actual;
    DecisionComparison comparison;
    std::optional<DecisionHint> hint;

    /// The address of the first bit that differs in a block.
    std::size_t firstAddress(const BlockDifference& difference) const {
        return expected.blocks[difference.block].firstBit + difference.firstBit;
    }
};

/// What there is in the place of a bit: "1", "x, undefined" and so on.
std::string valueText(const MemoryWord& word);

void printText(std::ostream& stream, const CompareReport& report);

/// One JSON object on a line of its own.
void printJson(std::ostream& stream, const CompareReport& report);

/// A JUnit XML report, with a test for each block.
std::string junitText(const CompareReport& report);

}  // namespace quarzel::tool
