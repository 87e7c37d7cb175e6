// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <ostream>
#include <string>

#include "trace/trace_difference.hpp"

namespace quarzel::tool {

/// What `quarzel trace-diff` tells in the end.
struct TraceDiffReport {
    std::string fileA;
    std::string fileB;
    std::size_t linesA;  ///< lines of A that were read
    std::size_t linesB;
    TraceComparison comparison;
};

void printText(std::ostream& stream, const TraceDiffReport& report);

/// One JSON object on a line of its own.
void printJson(std::ostream& stream, const TraceDiffReport& report);

}  // namespace quarzel::tool
