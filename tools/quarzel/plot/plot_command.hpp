// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel plot`, which draws the error rates of stored sweeps.
/// @param results  where it tells what it has drawn; must outlive the parse
void addPlotCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
