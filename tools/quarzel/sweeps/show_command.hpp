// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel show`, which prints a stored result of a sweep.
/// @param results  where it prints it; must outlive the parse
void addShowCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
