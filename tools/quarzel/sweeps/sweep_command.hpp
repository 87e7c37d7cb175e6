// SPDX-License-Identifier: MIT
#pragma once

#include <functional>
#include <memory>
#include <ostream>

#include "options/cli_fwd.hpp"
#include "sweep/run.hpp"

namespace quarzel::tool {

/// Makes the workers of a sweep.
/// @param threads  of each process; 0: the usual number
using MakeWorkers = std::function<std::unique_ptr<sweep::Workers>(unsigned threads)>;

/// Workers that are threads of this process, usually one for each core.
std::unique_ptr<sweep::Workers> makeThreadWorkers(unsigned threads);

/// Add `quarzel sweep`, which simulates a link over Eb/N0.
/// @param results  where it writes its report; must outlive the parse
void addSweepCommand(CLI::App& app, std::ostream& results, MakeWorkers makeWorkers);

}  // namespace quarzel::tool
