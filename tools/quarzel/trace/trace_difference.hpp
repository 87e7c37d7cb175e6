// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>

#include "trace/trace_reader.hpp"
#include "trace/trace_table.hpp"

namespace quarzel::tool {

/// Where two traces first differ.
struct TraceDifference {
    std::optional<TraceTable> a;       ///< the table of A; none when A has ended
    std::optional<TraceTable> b;       ///< the table of B, likewise
    std::optional<std::size_t> index;  ///< the first value that differs; none when the tables have not the
                                       ///< same block, pass or size, so that their values do not compare
    std::size_t values = 0;            ///< values of the table that differ

    /// Whether it lies in a termination step.
    bool isTermination() const { return index && a->isTermination(*index); }
};

struct TraceComparison {
    std::optional<TraceDifference> first;  ///< none when the traces are equal
    std::size_t blocks = 0;                ///< whose inputs were compared
    std::size_t passes = 0;                ///< that were compared
    std::size_t termination = 0;           ///< values of termination steps that differ, as far as it was read
    bool elsewhere = false;                ///< whether there is a difference outside the termination steps
};

/// Compare two traces, table by table, up to the first difference outside the termination steps.
/// @param ignoreTermination  let no difference in a termination step be the first
/// @throws ToolError when a trace cannot be read
TraceComparison compareTraces(TraceReader& a, TraceReader& b, bool ignoreTermination);

}  // namespace quarzel::tool
