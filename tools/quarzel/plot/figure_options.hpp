// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>

#include "plot/figure_layout.hpp"

namespace quarzel::tool {

/// Add the options of size, text, axes and legend to a command.
/// @param choice  receives them; must outlive the parse
void addFigureOptions(CLI::App& command, FigureChoice& choice);

}  // namespace quarzel::tool
