// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <optional>
#include <ostream>
#include <string_view>

#include "files/output_file.hpp"
#include "quarzel/core.hpp"
#include "trace/trace_options.hpp"
#include "trace/trace_writer.hpp"

namespace quarzel::tool {

/// Where the trace of a decode goes. Nothing of it is kept in memory. A file is whole or not there.
class TraceFile {
  public:
    /// @param options  must outlive it
    /// @param results  standard output
    /// @throws ToolError when the file cannot be made
    TraceFile(const TraceOptions& options, std::ostream& results);
    TraceFile(const TraceFile&) = delete;
    TraceFile& operator=(const TraceFile&) = delete;

    /// Trace the next passes of a core. The lines of a text trace come as messages; the core's handler is to
    /// hand them on. What cannot be written is thrown by the decode.
    void start(Core& core);

    /// Write a line of a text trace.
    void writeLine(std::string_view line);

    /// Put the whole trace in its place.
    /// @throws ToolError when that fails
    void finish();

  private:
    void write(std::string_view text);

    const TraceOptions& itsOptions;
    std::ostream& itsResults;
    std::optional<OutputFile> itsFile;       ///< none: standard output
    std::unique_ptr<TraceWriter> itsWriter;  ///< null: text
};

}  // namespace quarzel::tool
