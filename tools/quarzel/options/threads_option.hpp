// SPDX-License-Identifier: MIT
#pragma once

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// As many threads as this machine runs at once.
unsigned allCores();

/// Add --threads to a command.
/// @param threads  holds the default, which is to mean all cores, and receives the choice; must outlive the
/// parse
void addThreadsOption(CLI::App& command, unsigned& threads);

}  // namespace quarzel::tool
