// SPDX-License-Identifier: MIT
#include "trace/trace_reader.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <charconv>
#include <string_view>

namespace quarzel::tool {

namespace {

constexpr const char* ruler = "a line of dashes";

/// Take the next word, up to a blank, off the front of a text.
std::string_view takeWord(std::string_view& text) {
    text.remove_prefix(std::min(text.find_first_not_of(" \t"), text.size()));
    const std::string_view word = text.substr(0, text.find_first_of(" \t"));
    text.remove_prefix(word.size());
    return word;
}

/// Take `front` off a text.
/// @return whether the text begins with it
bool take(std::string_view& text, std::string_view front) {
    const bool found = text.starts_with(front);
    text.remove_prefix(found ? front.size() : 0);
    return found;
}

template <class Number>
bool takeNumber(std::string_view& text, Number& number) {
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    text.remove_prefix(static_cast<std::size_t>(end - text.data()));
    return error == std::errc();
}

/// A soft input, which a trace shows as a word.
std::optional<std::int16_t> inputWord(std::string_view text) {
    std::int16_t word = 0;
    if (!takeNumber(text, word) || !text.empty() || word % 16 != 0) {
        return std::nullopt;
    }
    return word;
}

/// The word of a real number.
std::optional<std::int16_t> realWord(std::string_view text) {
    double real = 0;
    if ((take(text, "+") && text.starts_with('-')) || !takeNumber(text, real) || !text.empty()) {
        return std::nullopt;
    }
    const double raw = real * 8;
    // What is not a number fails the first comparison.
    if (!(raw >= -2048 && raw <= 2047) || raw != static_cast<int>(raw)) {
        return std::nullopt;
    }
    return static_cast<std::int16_t>(static_cast<int>(raw) * 16);
}

bool isRuler(std::string_view line) {
    return !line.empty() && line.find_first_not_of('-') == std::string_view::npos;
}

bool isTableHeading(std::string_view line) {
    if (takeWord(line) != "n") {
        return false;
    }
    for (const TraceColumn& column : passColumns()) {
        if (takeWord(line) != column.heading()) {
            return false;
        }
    }
    return takeWord(line).empty();
}

}  // namespace

std::optional<TraceTable> TraceReader::next() {
    if (itsPassIsPending) {
        return readPass();
    }
    const bool isFirst = itsPass.steps == 0;
    skipBetweenTables();
    if (itsLines.ended() && !isFirst) {
        return std::nullopt;
    }
    readRuler();
    const char* const expected = isFirst ? "itsSys [0]=[...]" : "decode=N siso=N or itsSys [0]=[...]";
    const std::string_view line = itsLines.text();
    if (!isFirst && line.starts_with("decode=")) {
        readPassHeading();
        return readPass();
    }
    if (!line.starts_with(traceStreams[0].label)) {
        itsLines.fail(expected);
    }
    TraceTable inputs = readInputs();
    // The number of the block stands in the heading of its first pass.
    itsPass.steps = inputs.steps;
    skipBetweenTables();
    readRuler();
    readPassHeading();
    inputs.decode = itsPass.decode;
    return inputs;
}

void TraceReader::skipBetweenTables() {
    while (itsLines.isWhole() && (itsLines.text().empty() || itsLines.text().starts_with("WARNING:"))) {
        itsLines.advance();
    }
}

void TraceReader::readRuler() {
    if (!isRuler(itsLines.text())) {
        itsLines.fail(ruler);
    }
    itsLines.advance();
}

TraceTable TraceReader::readInputs() {
    TraceTable inputs;
    inputs.firstLine = itsLines.number();
    for (const TraceStream& stream : traceStreams) {
        std::string_view line = itsLines.text();
        if (!take(line, stream.label) || !line.ends_with(']')) {
            itsLines.fail(fmt::format("{}...]", stream.label));
        }
        line.remove_suffix(1);
        std::uint32_t count = 0;
        for (std::string_view word = takeWord(line); !word.empty(); word = takeWord(line)) {
            const auto value = inputWord(word);
            if (!value) {
                itsLines.fail(fmt::format(", position {}", count), fmt::format("'{}'", word),
                              "a multiple of 16 from -32768 to 32752");
            }
            inputs.values.push_back(*value);
            ++count;
        }
        if (inputs.steps == 0) {
            if (count < 3) {
                itsLines.fail("", fmt::format("a stream of {} values", count), "3 values or more");
            }
            inputs.steps = count;
        } else if (count != inputs.steps) {
            itsLines.fail("", fmt::format("a stream of {} values", count),
                          fmt::format("{}, as many as in line {}", inputs.steps, inputs.firstLine));
        }
        itsLines.advance();
    }
    return inputs;
}

void TraceReader::readPassHeading() {
    constexpr const char* heading = "decode=N siso=N";
    constexpr const char* columns = "the heading of the columns, 'n int a0 ... ext'";
    std::string_view line = itsLines.text();
    std::uint32_t siso = 0;
    if (!take(line, "decode=") || !takeNumber(line, itsPass.decode) || !take(line, " siso=") ||
        !takeNumber(line, siso) || !line.empty()) {
        itsLines.fail(heading);
    }
    itsPass.siso = siso;
    itsLines.advance();
    if (!isTableHeading(itsLines.text())) {
        itsLines.fail(columns);
    }
    itsLines.advance();
    itsPass.firstLine = itsLines.number();
    itsPassIsPending = true;
}

TraceTable TraceReader::readPass() {
    itsPassIsPending = false;
    TraceTable pass = itsPass;
    pass.values.reserve(pass.steps * passColumns().size());
    for (std::uint32_t step = 0; step < pass.steps; ++step) {
        if (itsTerminationOptional && step + 3 == pass.steps &&
            (itsLines.text().empty() || isRuler(itsLines.text()))) {
            break;
        }
        readRow(step, pass.values);
    }
    return pass;
}

void TraceReader::readRow(std::uint32_t step, std::vector<std::int16_t>& values) {
    std::string_view line = itsLines.text();
    std::uint32_t number = 0;
    if (!takeNumber(line, number) || number != step) {
        itsLines.fail(fmt::format("step {} of 0 to {}", step, itsPass.steps - 1));
    }
    for (const TraceColumn& column : passColumns()) {
        const std::string_view word = takeWord(line);
        if (word.empty()) {
            itsLines.fail("", fmt::format("a row that ends before column {}", column.heading()),
                          fmt::format("a step and {} values", passColumns().size()));
        }
        const auto value = realWord(word);
        if (!value) {
            itsLines.fail(", column " + column.heading(), fmt::format("'{}'", word),
                          "a multiple of 0.125 from -256 to 255.875");
        }
        values.push_back(*value);
    }
    if (!takeWord(line).empty()) {
        itsLines.fail("", "a row with more columns than ext",
                      fmt::format("a step and {} values", passColumns().size()));
    }
    itsLines.advance();
}

}  // namespace quarzel::tool
