// SPDX-License-Identifier: MIT
#pragma once

#include <istream>
#include <string>

#include "captures/capture_file.hpp"

/// The formats of captures. `file` is the name for error messages, `scale` is there for real numbers.
namespace quarzel::tool {

/// Types: int8, int16 and int32 for soft values, float32 and float64 for real numbers.
Capture readNpyCapture(std::istream& stream, const std::string& file, std::optional<double> scale);
Capture readCsvCapture(std::istream& stream, const std::string& file, std::optional<double> scale);

}  // namespace quarzel::tool
