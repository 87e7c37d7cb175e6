// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "quarzel/core.hpp"
#include "trace/trace_writer.hpp"

namespace quarzel::tool {

/// A form in which the values of a trace are written for other programs, a row for each. A row is made of the
/// block's number, `pass`, the number of the pass, `step`, that of the step, `signal`, the signal's name,
/// `state`, the number of the column, `raw`, the value in units of 1/8, `real`, the real number, and `end`.
struct TraceRowForm {
    const char* start;  ///< before the first row
    const char* first;  ///< before the first value of the first row
    const char* next;   ///< likewise of every other row, with what ends the row before it
    const char* pass;
    const char* step;
    const char* signal;
    const char* state;
    const char* raw;
    const char* real;
    const char* end;      ///< of the rows, with what ends the last one
    const char* nothing;  ///< in the place of a pass or number that there is not
};

extern const TraceRowForm csvRows;
extern const TraceRowForm jsonRows;

/// Writes passes as rows, one for each value, all those of a step or stream after one another. The soft
/// inputs of a block come before its first pass.
class TraceRows : public TraceWriter {
  public:
    /// @param form  must outlive it
    TraceRows(const TraceRowForm& form, Write write);

    void add(const vardel_ip_quarzel_pass& pass) override;
    void end() override;

  private:
    void addInputs(const vardel_ip_quarzel_pass& pass);
    void startTable(unsigned long long block, std::optional<unsigned> pass);
    void append(std::uint32_t step, unsigned column, std::int16_t word);
    void write();

    const TraceRowForm& itsForm;
    Write itsWrite;
    std::vector<std::string> itsColumns;  ///< the part of a row between step and value, by column
    std::vector<std::string> itsValues;   ///< the part from the value on, by the value less the lowest one
    std::string itsBefore;                ///< the part before the step
    bool itsHasRows = false;
    std::string itsText;  ///< rows to be written together
};

}  // namespace quarzel::tool
