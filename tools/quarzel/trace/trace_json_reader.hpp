// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <string_view>

#include "trace/trace_fields.hpp"
#include "trace/trace_lines.hpp"
#include "trace/trace_row_reader.hpp"

namespace quarzel::tool {

/// Reads a trace as JSON Lines, an object on each line, or as the tool writes JSON: the same as the members
/// of one array. The members of an object are numbers, texts, null, and arrays of them for the states of a
/// signal.
class TraceJsonReader : public TraceRowReader {
  public:
    /// @param lines  at the first object or at the bracket before it
    /// @param units  of values whose field does not say it
    TraceJsonReader(std::unique_ptr<TraceLines> lines, TraceUnits units);

    bool next(TraceRow& row) override;

  private:
    void readObject(std::string_view text);
    void readMember(std::string_view& text);
    void readArray(std::string_view name, std::string_view& text);
    void takeValue(const TraceField& field, std::string_view text, std::string_view name);
    [[noreturn]] void fail() const;

    std::unique_ptr<TraceLines> itsLines;
    TraceFields itsFields;
    bool itsIsArray;
    bool itsIsEnd = false;  ///< the bracket after the last object has been read
};

}  // namespace quarzel::tool
