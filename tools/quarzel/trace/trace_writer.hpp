// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <ostream>
#include <string_view>

#include "trace/trace_decoder.hpp"

namespace quarzel::tool {

/// Writes what a decoder traces, row by row, to a stream. The stream's formatting and locale do not matter.
class TraceWriter {
  public:
    TraceWriter() = default;
    TraceWriter(const TraceWriter&) = delete;
    TraceWriter& operator=(const TraceWriter&) = delete;
    virtual ~TraceWriter() = default;

    /// Write the soft inputs of the block that the decoder has just taken apart.
    virtual void writeInputs(const TraceDecoder& decoder) = 0;

    /// Write the pass that the decoder has just run.
    virtual void writePass(TraceDecoder& decoder, unsigned siso) = 0;

    /// Write what stands after the last pass.
    virtual void end() {}
};

/// Make a writer; what stands before the first block is written at once.
/// @param form  "text", "csv" or "json"
std::unique_ptr<TraceWriter> makeTraceWriter(std::string_view form, std::ostream& stream);

}  // namespace quarzel::tool
