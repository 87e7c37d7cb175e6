// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>
#include <functional>
#include <memory>
#include <ostream>

#include "sweep/run.hpp"

namespace quarzel::tool {

/// Makes those who do the work of a sweep.
/// @param threads  of each process; 0: as is usual
using MakeWorkers = std::function<std::unique_ptr<sweep::Workers>(unsigned threads)>;

/// Workers that are threads of this process, usually one for each core.
std::unique_ptr<sweep::Workers> makeThreadWorkers(unsigned threads);

/// Add `quarzel sweep`, which simulates a link over Eb/N0.
/// @param results  where it writes what it tells; must outlive the parse
void addSweepCommand(CLI::App& app, std::ostream& results, MakeWorkers makeWorkers);

}  // namespace quarzel::tool
