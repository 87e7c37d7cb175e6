// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

#include "plot/curve_styles.hpp"
#include "plot/figure_layout.hpp"
#include "plot/script.hpp"
#include "plot/script_pen.hpp"

namespace quarzel::tool {

/// Put the frame of the next plot in its place.
void addMargins(Script& script, const FigureLayout& layout, const Box& box);

/// Draw the legend: a plot without axes whose coordinates are points. Nothing can be plotted after it.
/// @param styles  of the curves
void addLegend(Script& script, const FigureLayout& layout, const std::vector<CurveStyle>& styles,
               const ScriptPen& pen, double fontSize);

}  // namespace quarzel::tool
