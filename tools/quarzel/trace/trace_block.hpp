// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "trace/trace_row_reader.hpp"
#include "trace/trace_signals.hpp"
#include "trace/trace_value.hpp"

namespace quarzel::tool {

/// The termination steps at the end of a pass, whose metrics no core computes.
inline constexpr std::uint32_t terminationSteps = 3;

/// Values of a trace by step and column: those of a pass, or the soft inputs of a block.
class TraceTable {
  public:
    /// @param firstColumn  the number of its first column
    TraceTable(unsigned firstColumn, std::size_t columns) : itsFirstColumn(firstColumn), itsWidth(columns) {}

    /// One more than the highest step that has a value.
    std::uint32_t steps() const { return static_cast<std::uint32_t>(itsValues.size() / itsWidth); }

    /// The value of a column at a step; none where it is not told.
    TraceValue value(std::uint32_t step, unsigned column) const;

    /// Where that value stands, as its reader counts.
    std::size_t line(std::uint32_t step, unsigned column) const { return itsLines[indexOf(step, column)]; }

    /// Set a value that was none.
    void set(std::uint32_t step, unsigned column, TraceValue value, std::size_t line);

    std::size_t firstLine() const { return itsFirstLine; }
    std::size_t lastLine() const { return itsLastLine; }

  private:
    std::size_t indexOf(std::uint32_t step, unsigned column) const {
        return std::size_t{step} * itsWidth + (column - itsFirstColumn);
    }

    unsigned itsFirstColumn;
    std::size_t itsWidth;
    std::size_t itsFirstLine = SIZE_MAX;
    std::size_t itsLastLine = 0;
    std::vector<TraceValue> itsValues;  ///< [steps][columns]
    std::vector<std::uint32_t> itsLines;
};

/// What a trace tells of a block.
class TraceBlock {
  public:
    explicit TraceBlock(std::optional<std::uint64_t> number) : itsNumber(number) {}

    /// Its number, from 0; none when the trace does not number its blocks.
    std::optional<std::uint64_t> number() const { return itsNumber; }

    /// Take a value.
    /// @param pass  that it belongs to; ignored for soft inputs
    /// @param line  where it stands
    /// @return      whether the place was free, or held the same value
    bool add(std::optional<std::uint32_t> pass, std::uint32_t step, unsigned column, TraceValue value,
             std::size_t line);

    /// The columns that have values.
    const TraceColumnSet& columns() const { return itsColumns; }

    /// The tables of its passes by their numbers; that of its soft inputs is without one.
    const std::map<std::optional<std::uint32_t>, TraceTable>& tables() const { return itsTables; }

    /// The table of a pass, or of soft inputs; null when there is none.
    const TraceTable* table(std::optional<std::uint32_t> pass) const;

    /// The value of a column; none where it is not told.
    TraceValue value(std::optional<std::uint32_t> pass, std::uint32_t step, unsigned column) const;

    /// The highest step that has a value.
    std::uint32_t highestStep() const;

    /// Trellis steps of a block, with its termination steps, of which these are the values; none when no
    /// block size has so many.
    std::optional<std::uint32_t> steps() const;

  private:
    std::optional<std::uint64_t> itsNumber;
    TraceColumnSet itsColumns;
    std::map<std::optional<std::uint32_t>, TraceTable> itsTables;
};

/// Throw a ToolError unless a block tells each of its columns at every step in every pass, so that a trace
/// that was cut off is not taken for a whole one.
/// @param steps                that the block has, with its termination steps
/// @param terminationOptional  they may be missing
void requireWhole(const TraceBlock& block, std::uint32_t steps, bool terminationOptional,
                  const TraceRowReader& reader);

/// "pass 3 of block 0", "soft inputs of block 0".
std::string tableName(std::optional<std::uint64_t> block, std::optional<std::uint32_t> pass);

}  // namespace quarzel::tool
