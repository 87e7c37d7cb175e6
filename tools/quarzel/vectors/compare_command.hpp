// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

/// Add `quarzel compare`, which checks the decisions of a simulation against those expected.
/// @param results   where it writes what it tells; must outlive the parse
/// @param exitCode  receives ExitCode::decisionsDiffer when they do; must outlive the parse
void addCompareCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode);

}  // namespace quarzel::tool
