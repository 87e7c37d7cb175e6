// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel merge`, which joins results and parts of sweeps.
/// @param results  where it writes its report; must outlive the parse
void addMergeCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
