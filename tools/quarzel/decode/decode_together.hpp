// SPDX-License-Identifier: MIT
#pragma once

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "options/core_options.hpp"

namespace quarzel::tool {

class Progress;
class ToolError;

/// Decode all blocks of a capture in groups, on threads that have a model each. Decisions, warnings and
/// errors are the same for any number of threads.
///
/// @param threads  at least 1
/// @throws ToolError when a block could not be decoded: the first one of the capture
PackedBits decodeTogether(const Capture& capture, const CoreOptions& core, unsigned threads,
                          Progress& progress);

/// What the user is told when the library refused a block.
ToolError decodingError(const Capture& capture, std::size_t block, int status);

}  // namespace quarzel::tool
