// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel vectors`, which makes stimulus and expected response for a test bench.
/// @param results  where it writes what it tells; must outlive the parse
void addVectorsCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
