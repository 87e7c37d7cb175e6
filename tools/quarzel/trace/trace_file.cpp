// SPDX-License-Identifier: MIT
#include "trace/trace_file.hpp"

#include <string>

namespace quarzel::tool {

TraceFile::TraceFile(const TraceOptions& options, std::ostream& results)
    : itsOptions(options), itsResults(results) {
    if (!options.isToStandardOutput()) {
        itsFile.emplace(options.file);
    }
    if (options.form != "text") {
        itsRows.emplace(options.form == "csv" ? csvRows : jsonRows,
                        [this](std::string_view text) { write(text); });
    }
}

void TraceFile::start(Core& core) {
    if (itsRows) {
        core.passes(*itsOptions.passes, [this](const vardel_ip_quarzel_pass& pass) { itsRows->add(pass); });
    } else {
        core.trace(*itsOptions.passes);
    }
}

void TraceFile::writeLine(std::string_view line) {
    write(std::string(line) + '\n');
}

void TraceFile::finish() {
    if (itsRows) {
        itsRows->end();
    }
    if (itsFile) {
        itsFile->finish();
    }
}

void TraceFile::write(std::string_view text) {
    if (itsFile) {
        itsFile->write(text);
    } else {
        itsResults.write(text.data(), static_cast<std::streamsize>(text.size()));
    }
}

}  // namespace quarzel::tool
