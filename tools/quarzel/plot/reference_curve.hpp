// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace quarzel::tool {

/// Points of a curve: Eb/N0 in dB and an error rate.
using RatePoints = std::vector<std::pair<double, double>>;

/// Error rates from elsewhere, to be drawn beside measured ones.
struct ReferenceCurve {
    std::string label;
    RatePoints ber;   ///< may be empty
    RatePoints bler;  ///< may be empty
};

/// Read a reference curve: CSV with a header that names ebn0_db and ber, bler or both. An empty field is no
/// point.
/// @param argument  "LABEL=FILE", or a file whose name without its ending is the label
/// @throws ToolError when it cannot be read or is not well-formed
ReferenceCurve readReferenceCurve(const std::string& argument);

}  // namespace quarzel::tool
