// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "link/decibels.hpp"

namespace quarzel::tool {

/// Read Eb/N0 values separated by commas: each a number of dB with up to 6 decimals, or FIRST:STEP:LAST for
/// FIRST, FIRST + STEP and so on up to LAST. Exact: 0:0.1:1 has 11 values.
/// @return in ascending order, each once
/// @throws ToolError when an item is neither, or the range never ends or has very many values
std::vector<link::Decibels> readEbN0List(const std::string& option, const std::string& text);

}  // namespace quarzel::tool
