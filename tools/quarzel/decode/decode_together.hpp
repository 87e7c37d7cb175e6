// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "options/core_options.hpp"

namespace quarzel::tool {

class Progress;

/// Decode `count` blocks of a capture from the block `first` on, and keep their decisions.
/// @throws ToolError naming the first block that the model refuses
void decodePart(Core& core, const Capture& capture, std::size_t first, std::size_t count, int iterations,
                PackedBits& decisions);

/// Decode all blocks of a capture in groups, on threads that have a core each. Decisions, warnings and errors
/// are the same for any number of threads: the user is warned of the first block that warns, once.
///
/// @param threads  at least 1
/// @throws ToolError naming the first block that the model refuses
PackedBits decodeTogether(const Capture& capture, const CoreOptions& options, unsigned threads,
                          Progress& progress);

}  // namespace quarzel::tool
