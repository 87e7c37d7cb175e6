// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel rebuild`, which makes a block of a sweep again, decodes and traces it.
/// @param results  where it writes what it tells; must outlive the parse
void addRebuildCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
