// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>
#include <string>

#include "vectors/decision_comparison.hpp"

namespace quarzel::tool {

/// What `quarzel compare` tells.
struct CompareReport {
    const ExpectedDecisions& expected;
    std::string actualName;
    const MemoryImage& actual;
    DecisionComparison comparison;
};

void printText(std::ostream& stream, const CompareReport& report);

/// One JSON object on a line of its own.
void printJson(std::ostream& stream, const CompareReport& report);

}  // namespace quarzel::tool
