// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "plot/reference_curve.hpp"
#include "plot/sweep_curves.hpp"

namespace quarzel::tool {

/// What a curve of a picture is drawn from.
struct DrawnCurve {
    std::string label;
    std::vector<std::pair<double, MeasuredRate>> points;  ///< Eb/N0 in dB and rate
    bool hasIntervals;                                    ///< error bars are drawn
    bool isReference;                                     ///< dashed and grey, without marks
};

/// One of the pictures that stand side by side.
struct Panel {
    std::string name;  ///< of its vertical axis
    std::vector<DrawnCurve> curves;
};

struct Picture {
    std::string title;
    std::vector<Panel> panels;  ///< with the same labels
};

/// The error rates of measured curves and references over Eb/N0.
Picture ratesPicture(const std::vector<SweepCurve>& curves, const std::vector<ReferenceCurve>& references);

/// The error rates of a curve with a line for each iteration.
/// @param curve  one that has rates per iteration
Picture iterationsPicture(const SweepCurve& curve, const std::vector<ReferenceCurve>& references);

/// The script that draws a picture with gnuplot.
/// @param terminal  "svg", "png" or "pdf"
std::string plotScript(const Picture& picture, const std::string& terminal);

}  // namespace quarzel::tool
