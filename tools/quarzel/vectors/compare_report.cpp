// SPDX-License-Identifier: MIT
#include "vectors/compare_report.hpp"

#include <fmt/format.h>

#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>
#include <vector>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;
using Kind = MemoryWord::Kind;

/// The address at which a block and a bit are.
std::size_t addressOf(const CompareReport& report, const FirstDifference& first) {
    return report.expected.blocks[first.block].firstBit + first.bit;
}

std::string valueText(const MemoryWord& word) {
    switch (word.kind) {
        case Kind::missing:
            return "missing";
        case Kind::x:
            return "x, undefined";
        case Kind::z:
            return "z, undriven";
        case Kind::known:
            break;
    }
    return word.value > 1 ? fmt::format("{:x} (hexadecimal), which is not a bit", word.value)
                          : std::to_string(word.value);
}

std::string placeText(const MemoryWord& word, std::size_t address) {
    return fmt::format(", address @{:x}{}", address,
                       word.line == 0 ? "" : fmt::format(", line {}", word.line));
}

/// "5 of 480 differ: 3 wrong, 2 undefined (x)".
std::string bitsText(const CompareReport& report) {
    const DecisionComparison& comparison = report.comparison;
    const std::vector<std::pair<std::size_t, std::string_view>> kinds = {
        {comparison.wrong, "wrong"},
        {comparison.undefined, "undefined (x)"},
        {comparison.undriven, "undriven (z)"},
        {comparison.missing, "missing"}};
    std::vector<std::string> parts;
    for (const auto& [count, name] : kinds) {
        if (count > 0) {
            parts.push_back(fmt::format("{} {}", count, name));
        }
    }
    return fmt::format("{} of {} differ{}{}", comparison.bits(), report.expected.bits.size(),
                       parts.empty() ? "" : ": ", fmt::join(parts, ", "));
}

void printFirst(std::string& text, const CompareReport& report, const FirstDifference& first) {
    const ExpectedBlock& block = report.expected.blocks[first.block];
    const std::size_t address = addressOf(report, first);
    const MemoryWord& word = report.actual.words[address];
    reportLine(text, "block",
               fmt::format("{} of {} (K = {}{}{})", first.block + 1, report.expected.blocks.size(),
                           block.blockSize, block.about.empty() ? "" : ", ", block.about));
    reportLine(text, "bit", fmt::format("{} of 0 to {}", first.bit, block.blockSize - 1));
    reportLine(text, "expected bit", std::to_string(report.expected.bits[address]));
    reportLine(text, "actual bit", valueText(word) + placeText(word, address));
}

Json orNull(const std::string& text) {
    return text.empty() ? Json() : Json(text);
}

Json valueJson(const MemoryWord& word) {
    switch (word.kind) {
        case Kind::missing:
            return {};
        case Kind::x:
            return "x";
        case Kind::z:
            return "z";
        case Kind::known:
            break;
    }
    return word.value;
}

Json firstJson(const CompareReport& report, const FirstDifference& first) {
    const ExpectedBlock& block = report.expected.blocks[first.block];
    const std::size_t address = addressOf(report, first);
    const MemoryWord& word = report.actual.words[address];
    return {{"block", first.block + 1},
            {"block_size", block.blockSize},
            {"about", orNull(block.about)},
            {"bit", first.bit},
            {"value_expected", report.expected.bits[address]},
            {"value_actual", valueJson(word)},
            {"address", address},
            {"line", word.line == 0 ? Json() : Json(word.line)},
            {"trace_command", orNull(block.traceCommand)}};
}

}  // namespace

void printText(std::ostream& stream, const CompareReport& report) {
    const DecisionComparison& comparison = report.comparison;
    const std::size_t blocks = report.expected.blocks.size();
    std::string text;
    reportLine(text, "expected", report.expected.name);
    reportLine(text, "actual", report.actualName);
    if (comparison.isEqual()) {
        reportLine(text, "result", "the decisions are equal");
        reportLine(
            text, "compared",
            counted(blocks, "block", "blocks") + ", " + counted(report.expected.bits.size(), "bit", "bits"));
        stream << text;
        return;
    }
    reportLine(
        text, "result",
        comparison.first ? "the decisions differ" : "the decisions are equal, but go on after the last");
    if (comparison.first) {
        printFirst(text, report, *comparison.first);
    }
    reportLine(text, "blocks", fmt::format("{} of {} differ", comparison.blocks, blocks));
    reportLine(text, "bits", bitsText(report));
    if (comparison.beyond > 0) {
        reportLine(text, "too many",
                   counted(comparison.beyond, "word", "words") + " after the last decision expected");
    }
    if (comparison.first) {
        const std::string& command = report.expected.blocks[comparison.first->block].traceCommand;
        text += command.empty() ? "" : "\nThe model's trace of this block:\n  " + command + '\n';
    }
    stream << text;
}

void printJson(std::ostream& stream, const CompareReport& report) {
    const DecisionComparison& comparison = report.comparison;
    const Json object = {{"expected", report.expected.name},
                         {"actual", report.actualName},
                         {"equal", comparison.isEqual()},
                         {"blocks", report.expected.blocks.size()},
                         {"blocks_differing", comparison.blocks},
                         {"bits", report.expected.bits.size()},
                         {"bits_differing", comparison.bits()},
                         {"wrong", comparison.wrong},
                         {"undefined", comparison.undefined},
                         {"undriven", comparison.undriven},
                         {"missing", comparison.missing},
                         {"too_many", comparison.beyond},
                         {"first", comparison.first ? firstJson(report, *comparison.first) : Json()}};
    // A file name need not be UTF-8; what is not becomes U+FFFD.
    stream << object.dump(-1, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace quarzel::tool
