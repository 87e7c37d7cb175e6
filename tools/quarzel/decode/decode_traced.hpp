// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "options/core_options.hpp"

namespace quarzel::tool {

class Progress;
class TraceFile;

/// Decode one block of a capture after the other, and trace those from a block on.
/// @param firstTraced  that block, from 0
/// @param trace        receives the trace and is finished
/// @throws ToolError naming the first block that the model refuses, or when the trace cannot be written
PackedBits decodeTraced(const Capture& capture, const CoreOptions& options, std::size_t firstTraced,
                        TraceFile& trace, Progress& progress);

}  // namespace quarzel::tool
