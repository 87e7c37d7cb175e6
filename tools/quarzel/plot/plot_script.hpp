// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "plot/figure_layout.hpp"
#include "plot/picture.hpp"

namespace quarzel::tool {

/// The script that draws a picture with gnuplot.
/// @param terminal  "svg", "png" or "pdf"
/// @throws ToolError when there is no room for the curves or the legend
std::string plotScript(const Picture& picture, const FigureChoice& choice, const std::string& terminal);

}  // namespace quarzel::tool
