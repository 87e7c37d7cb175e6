// SPDX-License-Identifier: MIT
#include "trace/trace_csv_reader.hpp"

#include <fmt/format.h>

#include "options/text_items.hpp"
#include "tool_error.hpp"
#include "trace/trace_words.hpp"

namespace quarzel::tool {

TraceCsvReader::TraceCsvReader(std::unique_ptr<TraceLines> lines, TraceUnits units)
    : TraceRowReader(lines->name(), "line"), itsLines(std::move(lines)), itsFields(units) {
    if (!itsLines->isWhole()) {
        itsLines->fail("a trace: a line of dashes, a CSV header, a JSON object or an npy header");
    }
    for (const std::string_view name : itemsOf(itsLines->text(), ',')) {
        const std::optional<TraceField> field = TraceField::named(trimmed(name));
        if (!field && itsHeader.empty()) {
            itsLines->fail("a trace: a line of dashes, a CSV header, a JSON object or an npy header");
        }
        if (!field) {
            itsLines->fail(fmt::format(", column {}", itsHeader.size() + 1),
                           fmt::format("'{}'", trimmed(name)), "one of " + TraceField::names());
        }
        itsHeader.push_back(*field);
    }
    itsLines->advance();
}

bool TraceCsvReader::next(TraceRow& row) {
    while (itsLines->isWhole() && itsLines->text().empty()) {
        itsLines->advance();
    }
    if (itsLines->ended()) {
        return false;
    }
    if (!itsLines->isWhole()) {
        itsLines->fail(fmt::format("{} values and a line end", itsHeader.size()));
    }
    const std::vector<std::string_view> items = itemsOf(itsLines->text(), ',');
    if (items.size() != itsHeader.size()) {
        itsLines->fail("", fmt::format("a row of {} values", items.size()),
                       fmt::format("{}, as in the header", itsHeader.size()));
    }
    itsFields.start(itsLines->number());
    for (std::size_t i = 0; i < items.size(); ++i) {
        const std::string_view item = trimmed(items[i]);
        if (!itsFields.take(itsHeader[i], item)) {
            itsLines->fail(fmt::format(", column {}", i + 1), fmt::format("'{}'", item),
                           itsFields.expectedOf(itsHeader[i]));
        }
    }
    if (const std::string problem = itsFields.finish(row); !problem.empty()) {
        throw fileError(name(), fmt::format("line {} {}", itsLines->number(), problem),
                        "give step, pass, and signal and value, or columns named as signals");
    }
    itsLines->advance();
    return true;
}

}  // namespace quarzel::tool
