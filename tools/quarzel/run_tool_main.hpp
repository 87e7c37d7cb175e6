// SPDX-License-Identifier: MIT
#pragma once

#include "sweeps/make_workers.hpp"

namespace quarzel::tool {

/// All that main() does: the command line, and its errors for the user.
/// @param makeWorkers  makes who do the work of sweeps
/// @return             the exit code
int runToolMain(int argc, const char* const* argv, const MakeWorkers& makeWorkers);

}  // namespace quarzel::tool
