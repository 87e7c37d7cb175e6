// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"
#include "sweeps/make_workers.hpp"

namespace quarzel::tool {

/// Add `quarzel sweep`, which simulates a link over Eb/N0.
/// @param results  where it writes its report; must outlive the parse
void addSweepCommand(CLI::App& app, std::ostream& results, MakeWorkers makeWorkers);

}  // namespace quarzel::tool
