// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"
#include "sweeps/make_workers.hpp"

namespace quarzel::tool {

/// Add `quarzel threshold`, which looks for the Eb/N0 at which a block error rate is reached.
/// @param results  where it prints what it finds; must outlive the parse
void addThresholdCommand(CLI::App& app, std::ostream& results, MakeWorkers makeWorkers);

}  // namespace quarzel::tool
