// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "plot/sweep_curves.hpp"

namespace quarzel::tool {

/// What a picture of several curves says about them.
struct CurveLabels {
    std::string title;                ///< what all curves share
    std::vector<std::string> labels;  ///< of each curve what differs; never empty
};

/// @param curves  at least one
CurveLabels labelsOf(const std::vector<SweepCurve>& curves);

}  // namespace quarzel::tool
