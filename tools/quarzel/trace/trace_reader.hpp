// SPDX-License-Identifier: MIT
#pragma once

#include <istream>
#include <optional>
#include <string>

#include "trace/trace_lines.hpp"
#include "trace/trace_table.hpp"

namespace quarzel::tool {

/// Reads the text form of a trace, table by table. A trace is made of blocks; a block is its soft inputs and
/// one or more passes.
///
/// Values are read for what they are, whatever number of digits they have. Carriage returns and blanks at the
/// end of a line, rulers of any length and, between tables, empty lines and warnings of the model are let
/// pass.
class TraceReader {
  public:
    /// @param name                 the file, for error messages
    /// @param terminationOptional  let passes end before their termination steps
    TraceReader(std::istream& stream, std::string name, bool terminationOptional)
        : itsLines(stream, std::move(name)), itsTerminationOptional(terminationOptional) {}

    /// The next table, or none at the end of the trace.
    /// @throws ToolError telling the line, what it is and what was expected
    std::optional<TraceTable> next();

    /// Lines read so far.
    std::size_t linesRead() const { return itsLines.number() - 1; }

  private:
    void skipBetweenTables();
    void readRuler();
    TraceTable readInputs();
    void readPassHeading();
    TraceTable readPass();
    void readRow(std::uint32_t step, std::vector<std::int16_t>& values);

    TraceLines itsLines;
    bool itsTerminationOptional;
    TraceTable itsPass;             ///< number and size of the pass that comes next, or came last
    bool itsPassIsPending = false;  ///< its heading has been read, its rows have not
};

}  // namespace quarzel::tool
