// SPDX-License-Identifier: MIT
#include "trace/trace_file.hpp"

#include <utility>

namespace quarzel::tool {

TraceFile::TraceFile(const TraceOptions& options, std::ostream& results)
    : itsBuffer([this, &results](std::string_view text) {
          if (itsFile) {
              itsFile->write(text);
          } else {
              results.write(text.data(), static_cast<std::streamsize>(text.size()));
          }
      }),
      itsStream(&itsBuffer) {
    if (!options.isToStandardOutput()) {
        itsFile.emplace(options.file);
    }
    itsWriter = makeTraceWriter(options.form, itsStream);
}

void TraceFile::finish() {
    itsWriter->end();
    check();
    if (itsFile) {
        itsFile->finish();
    }
}

void TraceFile::Buffer::check() const {
    if (itsFailure) {
        std::rethrow_exception(itsFailure);
    }
}

std::streamsize TraceFile::Buffer::xsputn(const char* text, std::streamsize size) {
    if (itsFailure) {
        return 0;
    }
    try {
        itsWrite({text, static_cast<std::size_t>(size)});
    } catch (...) {
        itsFailure = std::current_exception();
        return 0;
    }
    return size;
}

}  // namespace quarzel::tool
