// SPDX-License-Identifier: MIT
#pragma once

#include "trace/trace_comparison.hpp"

namespace quarzel::tool {

/// Compare two blocks, in the order in which the core computes.
/// @param readers  of the traces, for error messages
/// @param result   counts what is found; receives the first difference unless it has one, one outside the
///                 termination steps before one within
/// @throws ToolError when a block is not whole, or has nothing of what is to be compared
void compareBlocks(const TraceBlockPair& blocks, const std::array<const TraceRowReader*, 2>& readers,
                   const TraceMatching& matching, TraceComparison& result);

}  // namespace quarzel::tool
