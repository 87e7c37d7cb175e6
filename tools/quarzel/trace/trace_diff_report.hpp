// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

#include "trace/trace_comparison.hpp"

namespace quarzel::tool {

/// What `quarzel trace-diff` tells in the end. The traces are A and B, in this order.
struct TraceDiffReport {
    std::array<std::string, 2> files;
    std::array<const char*, 2> units;  ///< what the lines of each are
    TraceComparison comparison;
    std::vector<std::string> cause;  ///< sentences about the first difference; may be empty
};

void printText(std::ostream& stream, const TraceDiffReport& report);

/// One JSON object on a line of its own.
void printJson(std::ostream& stream, const TraceDiffReport& report);

/// The values that differ by signal, in the order in which the core computes them.
std::vector<std::pair<std::string, std::size_t>> differencesBySignal(const TraceComparison& comparison);

}  // namespace quarzel::tool
