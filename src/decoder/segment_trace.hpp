// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string_view>
#include <vector>

#include "decoder/segments.hpp"
#include "engine/t8.hpp"
#include "fixed/messages.hpp"

/// The trace lines of the parallel decoder.
namespace quarzel {

/// Forward segments and backward windows of a block.
void traceSegments(const Messages& messages, const std::vector<ABSegment>& alpha,
                   const std::vector<ABSegment>& beta);

/// Before a forward recursion: the metrics it starts from, and those that the next pass will start from as
/// the segment below left them, not yet masked.
void traceAlphaSegment(const Messages& messages, const ABSegment& segment, const T8& start, const T8& next);

/// After a backward recursion: the metrics at both ends and, unless the window is the block's first, the
/// entry of the boundary store that the lower end is about to be written to, not yet masked.
void traceBetaWindow(const Messages& messages, const ABSegment& window, const T8& from, const T8& to,
                     std::optional<std::size_t> entry);

/// All entries of a boundary store.
void traceBoundaries(const Messages& messages, std::string_view name, unsigned set,
                     const std::vector<T8>& boundaries);

}  // namespace quarzel
