// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <istream>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "trace/trace_value.hpp"

namespace quarzel::tool {

/// Values of one trellis step that a trace tells together.
struct TraceRow {
    std::optional<std::uint64_t> block;  ///< from 0; none when the trace does not number its blocks
    std::optional<std::uint32_t> pass;   ///< from 0; none for soft inputs
    std::uint32_t step = 0;              ///< from 0
    std::size_t line = 0;                ///< where it stands, from 1
    std::vector<std::pair<unsigned, TraceValue>> values;  ///< each with the number of its column
};

/// Reads a trace in one of its forms, row by row.
class TraceRowReader {
  public:
    /// @param name  the file, for error messages
    /// @param unit  what rows are counted in: "line" or "row"
    TraceRowReader(std::string name, const char* unit) : itsName(std::move(name)), itsUnit(unit) {}
    TraceRowReader(const TraceRowReader&) = delete;
    TraceRowReader& operator=(const TraceRowReader&) = delete;
    virtual ~TraceRowReader() = default;

    /// Read the next row.
    /// @return whether there was one
    /// @throws ToolError telling the line, what it is and what was expected
    virtual bool next(TraceRow& row) = 0;

    const std::string& name() const { return itsName; }
    const char* unit() const { return itsUnit; }

  private:
    std::string itsName;
    const char* itsUnit;
};

/// Make the reader of the form that a trace has, told by its first bytes.
/// @param stream  must outlive the reader
/// @param units   of numbers that do not say it themselves; none: real in the text form, else raw
/// @throws ToolError when the trace is empty or in no form that is known
std::unique_ptr<TraceRowReader> makeTraceReader(std::istream& stream, const std::string& name,
                                                std::optional<TraceUnits> units);

}  // namespace quarzel::tool
