// SPDX-License-Identifier: MIT
#pragma once

#include <exception>
#include <functional>
#include <memory>
#include <optional>
#include <ostream>
#include <streambuf>
#include <string>
#include <string_view>

#include "files/output_file.hpp"
#include "trace/trace_options.hpp"
#include "trace/trace_writer.hpp"

namespace quarzel::tool {

/// Where the trace of a decode goes, and its writer. Nothing of it is kept in memory. A file is whole or not
/// there.
class TraceFile {
  public:
    /// @param results  standard output
    /// @throws ToolError when the file cannot be made
    TraceFile(const TraceOptions& options, std::ostream& results);

    TraceWriter& writer() { return *itsWriter; }

    /// Tell what could not be written. A decoder that is at work can tell nobody.
    /// @throws ToolError when there is such a thing
    void check() const { itsBuffer.check(); }

    /// Put the whole trace in its place.
    /// @throws ToolError when that fails
    void finish();

  private:
    /// Hands on what it is given, at once, and keeps the first failure.
    class Buffer : public std::streambuf {
      public:
        explicit Buffer(std::function<void(std::string_view)> write) : itsWrite(std::move(write)) {}
        void check() const;

      protected:
        std::streamsize xsputn(const char* text, std::streamsize size) override;

      private:
        std::function<void(std::string_view)> itsWrite;
        std::exception_ptr itsFailure;
    };

    std::optional<OutputFile> itsFile;  ///< none: standard output
    Buffer itsBuffer;
    std::ostream itsStream;
    std::unique_ptr<TraceWriter> itsWriter;
};

}  // namespace quarzel::tool
