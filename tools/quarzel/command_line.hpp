// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "sweeps/make_workers.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

/// Do what the command line asks for.
/// @param results  receives what the user asked for, help included, and nothing else
/// @param makeWorkers  makes who do the work of sweeps
/// @return        how the tool is to end
/// @throws ToolError when the command line is wrong or its command fails
ExitCode runCommandLine(int argc, const char* const* argv, std::ostream& results,
                        const MakeWorkers& makeWorkers);

}  // namespace quarzel::tool
