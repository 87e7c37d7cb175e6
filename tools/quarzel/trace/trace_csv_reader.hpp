// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <vector>

#include "trace/trace_fields.hpp"
#include "trace/trace_lines.hpp"
#include "trace/trace_row_reader.hpp"

namespace quarzel::tool {

/// Reads a trace as CSV: a header of names, then rows of their values in any order. Empty lines are let pass.
class TraceCsvReader : public TraceRowReader {
  public:
    /// @param lines  at the header
    /// @param units  of values whose field does not say it
    TraceCsvReader(std::unique_ptr<TraceLines> lines, TraceUnits units);

    bool next(TraceRow& row) override;

  private:
    std::unique_ptr<TraceLines> itsLines;
    TraceFields itsFields;
    std::vector<TraceField> itsHeader;
};

}  // namespace quarzel::tool
