// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <map>
#include <memory>
#include <optional>
#include <utility>
#include <vector>

#include "trace/trace_block_reader.hpp"
#include "trace/trace_selection.hpp"

namespace quarzel::tool {

/// The blocks of two traces that are compared with one another.
using TraceBlockPair = std::array<std::shared_ptr<const TraceBlock>, 2>;

/// Where two traces first differ.
struct TraceDifference {
    TraceBlockPair blocks;              ///< null: that trace has ended
    std::optional<std::uint32_t> pass;  ///< none: soft inputs
    std::uint32_t steps = 0;            ///< of the block, with its termination steps
    bool isValue = false;               ///< false: one of the traces lacks the block or the pass
    std::uint32_t step = 0;
    unsigned column = 0;

    TraceValue value(std::size_t trace) const { return blocks[trace]->value(pass, step, column); }
    bool isTermination() const { return isValue && pass && step + terminationSteps >= steps; }
};

struct TraceComparison {
    /// A table of a block, by the number of the block in A.
    using Table = std::pair<std::optional<std::uint64_t>, std::optional<std::uint32_t>>;

    std::optional<TraceDifference> first;  ///< none when the traces are equal
    std::size_t blocks = 0;                ///< that were compared
    std::size_t passes = 0;                ///< likewise
    std::size_t values = 0;                ///< likewise, without termination steps that are ignored
    std::size_t termination = 0;           ///< values of termination steps that differ
    std::map<unsigned, std::size_t>
        byColumn;                          ///< values that differ, without termination steps that are ignored
    std::map<Table, std::size_t> byTable;  ///< the same values
    TraceColumnSet columns;                ///< that were compared in any block

    /// Values that differ, without those that are ignored.
    std::size_t differing() const;
    /// Whether there is a difference outside the termination steps.
    bool elsewhere = false;
};

/// How traces are compared.
struct TraceMatching {
    TraceSelection selection;
    std::optional<std::uint64_t> block;  ///< none: all blocks, matched by their numbers
    bool ignoreTermination = false;      ///< let no difference in a termination step count
};

/// Compare two traces to their ends. Blocks and passes that come before the first one of the other trace, and
/// signals that only one of them tells, do not count.
/// @throws ToolError when a trace cannot be read, or has nothing of what is to be compared
TraceComparison compareTraces(TraceBlockReader& a, TraceBlockReader& b, const TraceMatching& matching);

}  // namespace quarzel::tool
