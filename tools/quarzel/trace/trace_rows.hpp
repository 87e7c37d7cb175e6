// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

#include "quarzel/core.hpp"
#include "trace/trace_table.hpp"

namespace quarzel::tool {

/// A form in which the values of a trace are written for other programs.
struct TraceRowForm {
    const char* start;      ///< before the first row
    const char* separator;  ///< between two rows
    const char* end;        ///< after the last row
    const char* row;        ///< a row, a format of block, pass, step, signal, number, raw and real value
    const char* nothing;    ///< in the place of a pass or number that there is not
};

extern const TraceRowForm csvRows;
extern const TraceRowForm jsonRows;

/// Writes passes as rows, one for each value, all those of a step or stream after one another. The soft
/// inputs of a block come before its first pass.
class TraceRows {
  public:
    using Write = std::function<void(std::string_view text)>;

    TraceRows(const TraceRowForm& form, Write write);

    void add(const vardel_ip_quarzel_pass& pass);

    /// Write what stands after the last row.
    void end() { itsWrite(itsForm.end); }

  private:
    /// Where a value stands.
    struct Place {
        unsigned long long block;  ///< number of the block, from 1
        std::optional<unsigned> pass;
        std::uint32_t step;
    };

    void addInputs(const vardel_ip_quarzel_pass& pass);
    void append(const Place& place, const TraceColumn& column, std::int16_t word);
    void write();

    const TraceRowForm& itsForm;
    Write itsWrite;
    const char* itsSeparator = "";  ///< before the next row
    std::string itsText;            ///< rows to be written together
};

}  // namespace quarzel::tool
