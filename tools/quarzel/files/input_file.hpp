// SPDX-License-Identifier: MIT
#pragma once

#include <fstream>
#include <string>

namespace quarzel::tool {

/// Whether a name stands for standard input or output.
inline bool isStandardStream(const std::string& file) {
    return file == "-";
}

/// Open a file, or a pipe, for reading; "-" is standard input.
/// @throws ToolError when it does not exist, may not be read or is a directory
std::ifstream openInput(const std::string& file);

}  // namespace quarzel::tool
