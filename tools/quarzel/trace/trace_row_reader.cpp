// SPDX-License-Identifier: MIT
#include "trace/trace_row_reader.hpp"

#include "captures/npy_header.hpp"
#include "trace/trace_csv_reader.hpp"
#include "trace/trace_json_reader.hpp"
#include "trace/trace_npy_reader.hpp"
#include "trace/trace_text_reader.hpp"
#include "trace/trace_vcd_reader.hpp"

namespace quarzel::tool {

std::unique_ptr<TraceRowReader> makeTraceReader(std::istream& stream, const std::string& name,
                                                std::optional<TraceUnits> units) {
    const TraceUnits rawUnless = units.value_or(TraceUnits::raw);
    if (isNpy(stream, name)) {
        return std::make_unique<TraceNpyReader>(stream, name, rawUnless);
    }
    auto lines = std::make_unique<TraceLines>(stream, name);
    while (lines->isWhole() && lines->text().empty()) {
        lines->advance();
    }
    switch (lines->text().empty() ? '\0' : lines->text().front()) {
        case '-':
            return std::make_unique<TraceTextReader>(std::move(lines), units.value_or(TraceUnits::real));
        case '{':
        case '[':
            return std::make_unique<TraceJsonReader>(std::move(lines), rawUnless);
        case '$':
            return std::make_unique<TraceVcdReader>(std::move(lines));
        default:
            return std::make_unique<TraceCsvReader>(std::move(lines), rawUnless);
    }
}

}  // namespace quarzel::tool
