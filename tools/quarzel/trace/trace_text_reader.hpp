// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include "trace/trace_lines.hpp"
#include "trace/trace_row_reader.hpp"

namespace quarzel::tool {

/// Reads the text form of a trace. A trace is made of blocks; a block is its soft inputs, which may be
/// missing, and one or more passes with some of their columns and their rows in any order.
///
/// Values are read for what they are, whatever number of digits they have. Carriage returns and blanks at the
/// end of a line, rulers of any length and, between tables, empty lines and warnings of the model are let
/// pass.
class TraceTextReader : public TraceRowReader {
  public:
    /// @param units  of the numbers in the tables of passes
    TraceTextReader(std::unique_ptr<TraceLines> lines, TraceUnits units)
        : TraceRowReader(lines->name(), "line"), itsLines(std::move(lines)), itsUnits(units) {}

    bool next(TraceRow& row) override;

  private:
    /// A soft input.
    struct Input {
        unsigned column;
        std::uint32_t step;
        std::size_t line;
        TraceValue value;
    };

    void skipBetweenTables();
    void readRuler();
    void readTable();
    void readInputs();
    void readPassHeading();
    void readColumns();
    bool isAtEndOfTable() const;
    void readRow(TraceRow& row);

    std::unique_ptr<TraceLines> itsLines;
    TraceUnits itsUnits;
    std::uint64_t itsBlock = 0;        ///< of the table that comes next, or came last
    std::uint32_t itsPass = 0;         ///< likewise
    std::vector<unsigned> itsColumns;  ///< of the table
    bool itsTableIsOpen = false;       ///< its heading has been read, rows may follow
    std::vector<Input> itsInputs;      ///< of the table
    std::size_t itsInputsHandedOut = 0;
};

}  // namespace quarzel::tool
