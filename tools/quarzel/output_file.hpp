// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>

/// Output files that are whole or not there. A file is written under another name beside its target, flushed
/// to the disk and then renamed, so that a reader never sees a part of it and a failure leaves what was there
/// before. What is not a regular file, a pipe or a device, is written directly.
namespace quarzel::tool {

/// Find out before long work whether an output could be written; nothing is left behind.
/// @throws ToolError when not
void probeOutput(const std::string& file);

/// Write an output.
/// @throws ToolError when that fails
void writeOutput(const std::string& file, std::string_view bytes);

}  // namespace quarzel::tool
