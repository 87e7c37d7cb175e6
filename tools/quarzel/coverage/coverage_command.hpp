// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel coverage`, which counts what blocks reach in the arithmetic of a core.
/// @param results  where it writes what it tells; must outlive the parse
void addCoverageCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
