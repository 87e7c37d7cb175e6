// SPDX-License-Identifier: MIT
#include "trace/trace_vcd_reader.hpp"

#include <fmt/format.h>

#include <algorithm>

#include "tool_error.hpp"
#include "trace/step_metrics.hpp"
#include "trace/trace_words.hpp"
#include "trace/vcd_variables.hpp"

namespace quarzel::tool {

TraceVcdReader::TraceVcdReader(std::unique_ptr<TraceLines> lines)
    : TraceRowReader(lines->name(), "line"), itsLines(std::move(lines)), itsVariables(vcdNames().size()) {
    readDeclarations();
    if (!itsLines->text().starts_with('#')) {
        itsLines->fail("a time, #0");
    }
    itsTimeLine = itsLines->number();
    itsLines->advance();
}

void TraceVcdReader::readDeclarations() {
    while (itsLines->text() != "$enddefinitions $end") {
        if (!itsLines->isWhole()) {
            itsLines->fail("$enddefinitions $end");
        }
        std::string_view line = itsLines->text();
        if (takeWord(line) == "$var") {
            takeWord(line);
            takeWord(line);
            const std::string code(takeWord(line));
            const auto name = std::ranges::find(vcdNames(), takeWord(line));
            if (name != vcdNames().end()) {
                const auto variable = static_cast<std::size_t>(name - vcdNames().begin());
                itsCodes[code] = variable;
                itsVariables[variable].isDeclared = true;
            }
        }
        itsLines->advance();
    }
    for (const char* name : {"pass", "code", "step"}) {
        const auto variable = std::ranges::find(vcdNames(), name) - vcdNames().begin();
        if (!itsVariables[static_cast<std::size_t>(variable)].isDeclared) {
            throw fileError(this->name(), fmt::format("has no variable {}", name),
                            "expected waves as 'quarzel decode --trace-format vcd' writes them");
        }
    }
    itsLines->advance();
}

/// Read on to the next time.
void TraceVcdReader::readChanges() {
    constexpr const char* expected = "a value such as b0101 !, or a time";
    while (!itsLines->text().starts_with('#')) {
        std::string_view line = itsLines->text();
        if (line.starts_with('$')) {  // $dumpvars and its $end, which converters write
            itsLines->advance();
            continue;
        }
        if (!takeFront(line, "b")) {
            itsLines->fail(expected);
        }
        const std::string_view bits = takeWord(line);
        const auto code = itsCodes.find(std::string(takeWord(line)));
        if (bits.empty() || bits.find_first_not_of("01xXzZ") != std::string_view::npos) {
            itsLines->fail(expected);
        }
        if (code != itsCodes.end()) {
            itsVariables[code->second].bits = bits;
        }
        itsLines->advance();
    }
}

std::uint32_t TraceVcdReader::place(std::size_t variable) const {
    std::uint32_t number = 0;
    const std::string& bits = itsVariables[variable].bits;
    const auto [end, error] = std::from_chars(bits.data(), bits.data() + bits.size(), number, 2);
    if (error != std::errc() || end != bits.data() + bits.size()) {
        throw fileError(name(), fmt::format("line {}, {} is '{}'", itsTimeLine, vcdNames()[variable], bits),
                        "expected a number that is known");
    }
    return number;
}

TraceValue TraceVcdReader::value(const Variable& variable) const {
    std::uint32_t number = 0;
    const std::string& bits = variable.bits;
    const auto [end, error] = std::from_chars(bits.data(), bits.data() + bits.size(), number, 2);
    if (error == std::errc() && end == bits.data() + bits.size()) {
        return TraceValue::ofRaw(wrapped(static_cast<int>(number)));
    }
    return TraceValue::read(bits, TraceUnits::raw).value_or(TraceValue::unknown());
}

bool TraceVcdReader::next(TraceRow& row) {
    if (itsLines->ended()) {
        return false;
    }
    readChanges();
    row.block.reset();
    if (itsVariables[0].isDeclared) {
        row.block = place(0);
    }
    row.pass = place(1);
    row.step = place(3);
    row.line = itsTimeLine;
    row.values.clear();
    const unsigned code = place(2);
    for (std::size_t variable = vcdPlaces.size(); variable < itsVariables.size(); ++variable) {
        if (itsVariables[variable].isDeclared) {
            row.values.emplace_back(vcdColumn(variable, code), value(itsVariables[variable]));
        }
    }
    itsTimeLine = itsLines->number();
    itsLines->advance();
    return true;
}

}  // namespace quarzel::tool
