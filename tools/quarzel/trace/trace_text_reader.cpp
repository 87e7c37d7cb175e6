// SPDX-License-Identifier: MIT
#include "trace/trace_text_reader.hpp"

#include <fmt/format.h>

#include "trace/trace_block.hpp"
#include "trace/trace_signals.hpp"
#include "trace/trace_words.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* ruler = "a line of dashes";

/// A soft input, which a trace shows as a word.
std::optional<TraceValue> inputWord(std::string_view text) {
    std::int16_t word = 0;
    if (takeNumber(text, word)) {
        return text.empty() && word % 16 == 0 ? std::optional(TraceValue::ofRaw(rawOf(word))) : std::nullopt;
    }
    const auto value = TraceValue::read(text, TraceUnits::raw);
    return value && !value->isNumber() ? value : std::nullopt;
}

bool isRuler(std::string_view line) {
    return !line.empty() && line.find_first_not_of('-') == std::string_view::npos;
}

bool isWarning(std::string_view line) {
    return line.starts_with("WARNING:");
}

}  // namespace

bool TraceTextReader::next(TraceRow& row) {
    if (itsInputsHandedOut == itsInputs.size()) {
        if (itsTableIsOpen && isAtEndOfTable()) {
            itsTableIsOpen = false;
        }
        if (!itsTableIsOpen) {
            skipBetweenTables();
            if (itsLines->ended()) {
                return false;
            }
            readTable();
        }
    }
    if (itsInputsHandedOut < itsInputs.size()) {
        const Input& input = itsInputs[itsInputsHandedOut++];
        row.block = itsBlock;
        row.pass.reset();
        row.step = input.step;
        row.line = input.line;
        row.values.assign(1, {input.column, input.value});
    } else {
        readRow(row);
    }
    return true;
}

bool TraceTextReader::isAtEndOfTable() const {
    const std::string_view line = itsLines->text();
    return itsLines->ended() || (itsLines->isWhole() && (line.empty() || isRuler(line) || isWarning(line)));
}

void TraceTextReader::skipBetweenTables() {
    while (itsLines->isWhole() && (itsLines->text().empty() || isWarning(itsLines->text()))) {
        itsLines->advance();
    }
}

void TraceTextReader::readRuler() {
    if (!isRuler(itsLines->text())) {
        itsLines->fail(ruler);
    }
    itsLines->advance();
}

/// Read up to the first row of the next pass, with the soft inputs where there are some before it.
void TraceTextReader::readTable() {
    readRuler();
    itsInputs.clear();
    itsInputsHandedOut = 0;
    if (itsLines->text().starts_with(traceStreams[0].label)) {
        readInputs();
        // The number of the block stands in the heading of its first pass.
        skipBetweenTables();
        readRuler();
    } else if (!itsLines->text().starts_with("decode=")) {
        itsLines->fail(fmt::format("decode=N siso=N or {}...]", traceStreams[0].label));
    }
    readPassHeading();
    readColumns();
    itsTableIsOpen = true;
}

void TraceTextReader::readInputs() {
    const std::size_t firstLine = itsLines->number();
    std::uint32_t steps = 0;
    for (const TraceStream& stream : traceStreams) {
        std::string_view line = itsLines->text();
        if (!takeFront(line, stream.label) || !line.ends_with(']')) {
            itsLines->fail(fmt::format("{}...]", stream.label));
        }
        line.remove_suffix(1);
        const unsigned column = *findColumn(stream.signal);
        std::uint32_t step = 0;
        for (std::string_view word = takeWord(line); !word.empty(); word = takeWord(line), ++step) {
            const auto value = inputWord(word);
            if (!value) {
                itsLines->fail(fmt::format(", position {}", step), fmt::format("'{}'", word),
                               "a multiple of 16 from -32768 to 32752");
            }
            itsInputs.push_back({column, step, itsLines->number(), *value});
        }
        const std::string found = fmt::format("a stream of {} values", step);
        if (itsLines->number() == firstLine) {
            steps = step;
            if (steps < terminationSteps) {
                itsLines->fail("", found, "3 values or more");
            }
        } else if (step != steps) {
            itsLines->fail("", found, fmt::format("{}, as many as in line {}", steps, firstLine));
        }
        itsLines->advance();
    }
}

void TraceTextReader::readPassHeading() {
    std::string_view line = itsLines->text();
    if (!takeFront(line, "decode=") || !takeNumber(line, itsBlock) || !takeFront(line, " siso=") ||
        !takeNumber(line, itsPass) || !line.empty()) {
        itsLines->fail("decode=N siso=N");
    }
    itsLines->advance();
}

void TraceTextReader::readColumns() {
    std::string_view line = itsLines->text();
    itsColumns.clear();
    bool isHeading = takeWord(line) == "n";
    for (std::string_view word = takeWord(line); isHeading && !word.empty(); word = takeWord(line)) {
        const std::optional<unsigned> column = columnUnder(word);
        isHeading = column && !isInput(*column);
        itsColumns.push_back(column.value_or(0));
    }
    if (!isHeading || itsColumns.empty()) {
        itsLines->fail("the heading of the columns, 'n int a0 ... ext' or some of them");
    }
    itsLines->advance();
    if (isAtEndOfTable()) {
        itsLines->fail("a step and its values");
    }
}

void TraceTextReader::readRow(TraceRow& row) {
    std::string_view line = itsLines->text();
    row.block = itsBlock;
    row.pass = itsPass;
    row.line = itsLines->number();
    row.values.clear();
    line.remove_prefix(std::min(line.find_first_not_of(" \t"), line.size()));
    if (!takeNumber(line, row.step) || (!line.empty() && line.front() != ' ' && line.front() != '\t')) {
        itsLines->fail(fmt::format("a step and {} values", itsColumns.size()));
    }
    for (const unsigned column : itsColumns) {
        const std::string_view word = takeWord(line);
        if (word.empty()) {
            itsLines->fail("",
                           fmt::format("a row that ends before column {}", traceColumns()[column].heading()),
                           fmt::format("a step and {} values", itsColumns.size()));
        }
        const auto value = TraceValue::read(word, itsUnits);
        if (!value) {
            itsLines->fail(", column " + traceColumns()[column].heading(), fmt::format("'{}'", word),
                           expectedValue(itsUnits));
        }
        row.values.emplace_back(column, *value);
    }
    if (!takeWord(line).empty()) {
        itsLines->fail("", "a row with more columns than " + traceColumns()[itsColumns.back()].heading(),
                       fmt::format("a step and {} values", itsColumns.size()));
    }
    itsLines->advance();
}

}  // namespace quarzel::tool
