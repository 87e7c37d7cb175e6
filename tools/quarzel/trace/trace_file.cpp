// SPDX-License-Identifier: MIT
#include "trace/trace_file.hpp"

#include <string>

#include "trace/trace_rows.hpp"
#include "trace/trace_vcd.hpp"

namespace quarzel::tool {

TraceFile::TraceFile(const TraceOptions& options, std::ostream& results)
    : itsOptions(options), itsResults(results) {
    if (!options.isToStandardOutput()) {
        itsFile.emplace(options.file);
    }
    const auto writeText = [this](std::string_view text) { write(text); };
    if (options.form == "vcd") {
        itsWriter = std::make_unique<TraceVcd>(writeText);
    } else if (options.form != "text") {
        itsWriter = std::make_unique<TraceRows>(options.form == "csv" ? csvRows : jsonRows, writeText);
    }
}

void TraceFile::start(Core& core) {
    if (itsWriter) {
        core.passes(*itsOptions.passes, [this](const vardel_ip_quarzel_pass& pass) { itsWriter->add(pass); });
    } else {
        core.trace(*itsOptions.passes);
    }
}

void TraceFile::writeLine(std::string_view line) {
    write(std::string(line) + '\n');
}

void TraceFile::finish() {
    if (itsWriter) {
        itsWriter->end();
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
