// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// Add `quarzel decode`, which decodes a capture and tells how fast and, against a reference, how well.
/// @param results  where it writes what it tells; must outlive the parse
void addDecodeCommand(CLI::App& app, std::ostream& results);

}  // namespace quarzel::tool
