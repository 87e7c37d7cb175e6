// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <ostream>
#include <string>

#include "decoder/trace_columns.hpp"
#include "trace/trace_writer.hpp"

namespace quarzel::tool {

/// A value of a trace, as a row for other programs.
struct TraceValue {
    std::uint64_t block;           ///< number of the block, from 1
    std::optional<unsigned> pass;  ///< none for soft inputs
    std::uint32_t step;
    TraceColumn column;
    std::int32_t raw;  ///< in units of the number format
    double real;       ///< what it stands for
};

/// A form in which rows are written.
struct TraceRowForm {
    const char* start;      ///< before the first row
    const char* separator;  ///< between two rows
    const char* end;        ///< after the last row
    void (*append)(std::string& text, const TraceValue& value);
};

extern const TraceRowForm csvRows;
extern const TraceRowForm jsonRows;

/// Writes a trace as rows, one for each value, all those of a step or stream after one another.
class TraceRowWriter : public TraceWriter {
  public:
    TraceRowWriter(std::ostream& stream, const TraceRowForm& form);

    void writeInputs(const TraceDecoder& decoder) override;
    void writePass(TraceDecoder& decoder, unsigned siso) override;
    void end() override;

  private:
    void append(const TraceDecoder& decoder, std::optional<unsigned> pass, std::uint32_t step,
                const TraceColumn& column, std::int16_t word);
    void write();

    std::ostream& itsStream;
    const TraceRowForm& itsForm;
    const char* itsSeparator;  ///< before the next row
    std::string itsText;       ///< rows to be written together
};

}  // namespace quarzel::tool
