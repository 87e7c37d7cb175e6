// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"
#include "sweeps/make_workers.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

/// Add `quarzel verify-result`, which runs the sweep of a result file again.
/// @param results   where it writes its report; must outlive the parse
/// @param exitCode  receives ExitCode::resultsDiffer when the result comes out different; must outlive
/// the parse
void addVerifyResultCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode,
                            MakeWorkers makeWorkers);

}  // namespace quarzel::tool
