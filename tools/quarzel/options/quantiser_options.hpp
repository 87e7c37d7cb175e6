// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>

#include "link/channel_thresholds.hpp"

namespace quarzel::tool {

/// Add --scale and --llr, of which one may be given.
/// @param quantiser  holds the default and receives the choice; must outlive the parse
void addQuantiserOptions(CLI::App& command, link::Quantiser& quantiser);

}  // namespace quarzel::tool
