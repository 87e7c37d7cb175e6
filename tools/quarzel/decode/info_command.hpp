// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel info`, which tells the valid block sizes and how the core works on a block of one of them.
/// @param results  where it writes what it tells; must outlive the parse
void addInfoCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
