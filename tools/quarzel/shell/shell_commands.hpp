// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel manual` and `quarzel completion`, which print what the installed tool ships for man and for
/// shells, and `quarzel help`. They tell of all commands that the app has when they run; the completion of
/// `help` knows those added before.
/// @param results  where they write; must outlive the parse
void addShellCommands(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
