// SPDX-License-Identifier: MIT
#pragma once

#include "plot/figure_layout.hpp"

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add the options of size, text, axes and legend to a command.
/// @param choice  receives them; must outlive the parse
void addFigureOptions(CLI::App& command, FigureChoice& choice);

}  // namespace quarzel::tool
