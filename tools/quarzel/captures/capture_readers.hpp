// SPDX-License-Identifier: MIT
#pragma once

#include <istream>
#include <string>

#include "captures/capture_file.hpp"

/// The formats of captures. `file` is the name for error messages.
namespace quarzel::tool {

Capture readNpyCapture(std::istream& stream, const std::string& file);
Capture readCsvCapture(std::istream& stream, const std::string& file);

}  // namespace quarzel::tool
