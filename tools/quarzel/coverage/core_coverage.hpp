// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <functional>
#include <vector>

#include "captures/capture_file.hpp"
#include "coverage/event_counts.hpp"

namespace quarzel::tool {

/// A block of a capture, and how it is decoded.
struct CoverageBlock {
    const Capture* capture;
    std::size_t row;
    int iterations;
};

/// Count the events of blocks on a core.
/// @param threads   how many threads decode; the counts do not depend on it
/// @param progress  told by any thread, one after the other, how many blocks are done; what it throws ends
///                  the work and is passed on
/// @throws ToolError when a block cannot be decoded
EventCounts countEvents(const std::vector<CoverageBlock>& blocks, int units, int algorithm, unsigned threads,
                        const std::function<void(std::size_t)>& progress);

}  // namespace quarzel::tool
