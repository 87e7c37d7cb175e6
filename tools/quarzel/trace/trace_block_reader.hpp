// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <optional>
#include <set>

#include "trace/trace_block.hpp"
#include "trace/trace_row_reader.hpp"

namespace quarzel::tool {

/// Reads a trace block by block, in memory that grows with one block.
class TraceBlockReader {
  public:
    explicit TraceBlockReader(std::unique_ptr<TraceRowReader> rows) : itsRows(std::move(rows)) {}

    /// The next block, or none at the end of the trace. Its rows are in any order, but together.
    /// @throws ToolError when the trace cannot be read
    std::optional<TraceBlock> next();

    /// The block of a number, or the only one of a trace with another number or without one. Its rows may
    /// stand between those of others. To be called before `next`, once.
    /// @throws ToolError when there is none
    TraceBlock choose(std::uint64_t number);

    const TraceRowReader& rows() const { return *itsRows; }

  private:
    void add(TraceBlock& block) const;
    void readRow() { itsHasRow = itsRows->next(itsRow); }

    std::unique_ptr<TraceRowReader> itsRows;
    TraceRow itsRow;         ///< the one that comes next
    bool itsHasRow = false;  ///< whether there is one
    bool itsHasBegun = false;
    std::set<std::optional<std::uint64_t>> itsNumbers;  ///< of the blocks read
};

}  // namespace quarzel::tool
