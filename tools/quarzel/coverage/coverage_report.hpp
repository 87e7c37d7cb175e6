// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

#include "coverage/event_counts.hpp"

namespace quarzel::tool {

/// What blocks reach on a core.
struct CoverageReport {
    std::string name;  ///< of the core
    int units;
    int algorithm;
    std::size_t blocks;
    EventCounts counts;
};

/// Print tables for people, one for each core.
void printText(std::ostream& stream, const std::vector<CoverageReport>& cores);

/// Print one JSON object.
void printJson(std::ostream& stream, const std::vector<CoverageReport>& cores);

}  // namespace quarzel::tool
