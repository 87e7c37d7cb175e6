// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

/// Add `quarzel trace-diff`, which finds where two traces first differ.
/// @param results   where it writes what it tells; must outlive the parse
/// @param exitCode  receives ExitCode::tracesDiffer when they do; must outlive the parse
void addTraceDiffCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode);

}  // namespace quarzel::tool
