// SPDX-License-Identifier: MIT
#include "trace/trace_json_reader.hpp"

#include <fmt/format.h>

#include "tool_error.hpp"
#include "trace/trace_signals.hpp"
#include "trace/trace_words.hpp"

namespace quarzel::tool {

namespace {

void skipBlanks(std::string_view& text) {
    text.remove_prefix(std::min(text.find_first_not_of(" \t"), text.size()));
}

bool takeMark(std::string_view& text, std::string_view mark) {
    skipBlanks(text);
    return takeFront(text, mark);
}

/// Take a number, a text in quotes or null off the front.
/// @return the number, or the text without its quotes, empty for null; none when there is nothing of the kind
std::optional<std::string_view> takeScalar(std::string_view& text) {
    if (takeMark(text, "\"")) {
        const std::size_t end = text.find_first_of("\"\\");
        if (end == std::string_view::npos || text[end] != '"') {
            return std::nullopt;
        }
        const std::string_view scalar = text.substr(0, end);
        text.remove_prefix(end + 1);
        return scalar;
    }
    const std::string_view scalar = text.substr(0, text.find_first_of(" \t,:]}"));
    text.remove_prefix(scalar.size());
    return scalar.empty() ? std::nullopt : std::optional(scalar == "null" ? std::string_view() : scalar);
}

}  // namespace

TraceJsonReader::TraceJsonReader(std::unique_ptr<TraceLines> lines, TraceUnits units)
    : TraceRowReader(lines->name(), "line"),
      itsLines(std::move(lines)),
      itsFields(units),
      itsIsArray(itsLines->text() == "[") {
    if (itsIsArray) {
        itsLines->advance();
    }
}

void TraceJsonReader::fail() const {
    itsLines->fail(itsIsArray ? "an object with step and value, or the end of the array, on a line"
                              : "an object with step and value on a line");
}

bool TraceJsonReader::next(TraceRow& row) {
    while (itsLines->isWhole() && itsLines->text().empty()) {
        itsLines->advance();
    }
    if (itsIsArray && !itsIsEnd && itsLines->text() == "]") {
        itsIsEnd = true;
        itsLines->advance();
        return next(row);
    }
    if (itsLines->ended() && itsIsEnd == itsIsArray) {
        return false;
    }
    if (!itsLines->isWhole() || itsIsEnd) {
        fail();
    }
    itsFields.start(itsLines->number());
    readObject(itsLines->text());
    if (const std::string problem = itsFields.finish(row); !problem.empty()) {
        throw fileError(name(), fmt::format("line {} {}", itsLines->number(), problem),
                        "give step, pass, and signal and value, or members named as signals");
    }
    itsLines->advance();
    return true;
}

void TraceJsonReader::readObject(std::string_view text) {
    if (!takeMark(text, "{")) {
        fail();
    }
    do {
        readMember(text);
    } while (takeMark(text, ","));
    if (!takeMark(text, "}")) {
        fail();
    }
    if (itsIsArray) {
        takeMark(text, ",");
    }
    skipBlanks(text);
    if (!text.empty()) {
        fail();
    }
}

void TraceJsonReader::readMember(std::string_view& text) {
    const std::optional<std::string_view> name = takeScalar(text);
    if (!name || !takeMark(text, ":")) {
        fail();
    }
    if (takeMark(text, "[")) {
        readArray(*name, text);
        return;
    }
    const std::optional<std::string_view> value = takeScalar(text);
    const std::optional<TraceField> field = TraceField::named(*name);
    if (!value) {
        fail();
    }
    if (!field) {
        itsLines->fail("", fmt::format("an object with a member '{}'", *name),
                       "one of " + TraceField::names());
    }
    takeValue(*field, *value, *name);
}

/// The values of a signal for all its states.
void TraceJsonReader::readArray(std::string_view name, std::string_view& text) {
    unsigned column = 0;
    while (column < traceColumns().size() && name != traceColumns()[column].signal) {
        ++column;
    }
    do {
        const std::optional<std::string_view> value = takeScalar(text);
        if (!value || column == traceColumns().size() || name != traceColumns()[column].signal) {
            fail();
        }
        takeValue({TraceField::Role::column, column++}, *value, name);
    } while (takeMark(text, ","));
    if (!takeMark(text, "]")) {
        fail();
    }
}

void TraceJsonReader::takeValue(const TraceField& field, std::string_view text, std::string_view name) {
    if (!itsFields.take(field, text)) {
        itsLines->fail(fmt::format(", {}", name), fmt::format("'{}'", text), itsFields.expectedOf(field));
    }
}

}  // namespace quarzel::tool
