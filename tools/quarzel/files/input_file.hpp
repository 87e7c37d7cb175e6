// SPDX-License-Identifier: MIT
#pragma once

#include <fstream>
#include <string>

namespace quarzel::tool {

/// Open a file, or a pipe, for reading.
/// @throws ToolError when it does not exist, may not be read or is a directory
std::ifstream openInput(const std::string& file);

}  // namespace quarzel::tool
