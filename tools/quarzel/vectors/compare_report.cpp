// SPDX-License-Identifier: MIT
#include "vectors/compare_report.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <string_view>
#include <utility>
#include <vector>

#include "report_text.hpp"
#include "vectors/compare_groups.hpp"

namespace quarzel::tool {

std::string valueText(const MemoryWord& word) {
    using Kind = MemoryWord::Kind;
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

namespace {

std::string placeText(const MemoryWord& word, std::size_t address) {
    return fmt::format(", address @{:x}{}", address,
                       word.line == 0 ? "" : fmt::format(", line {}", word.line));
}

/// "5 of 480 differ: 3 wrong, 2 undefined (x)".
std::string bitsText(const CompareReport& report) {
    const DifferingBits& bits = report.comparison.bits;
    const std::vector<std::pair<std::size_t, std::string_view>> kinds = {{bits.wrong, "wrong"},
                                                                         {bits.undefined, "undefined (x)"},
                                                                         {bits.undriven, "undriven (z)"},
                                                                         {bits.missing, "missing"}};
    std::vector<std::string> parts;
    for (const auto& [count, name] : kinds) {
        if (count > 0) {
            parts.push_back(fmt::format("{} {}", count, name));
        }
    }
    return fmt::format("{} of {} differ{}{}", bits.count(), report.expected.bits.size(),
                       parts.empty() ? "" : ": ", fmt::join(parts, ", "));
}

/// "2 of 30 differ: 11, 17".
std::string blocksText(const CompareReport& report) {
    constexpr std::size_t mostBlocks = 10;
    std::vector<std::string> numbers;
    for (const BlockDifference& difference : report.comparison.failing) {
        numbers.push_back(std::to_string(difference.block));
    }
    return fmt::format("{} of {} differ{}{}", numbers.size(), report.expected.blocks.size(),
                       numbers.empty() ? "" : ": ", listText(numbers, mostBlocks));
}

void printFirst(std::string& text, const CompareReport& report) {
    const BlockDifference& first = report.comparison.failing.front();
    const ExpectedBlock& block = report.expected.blocks[first.block];
    const std::size_t address = report.firstAddress(first);
    const MemoryWord& word = report.actual.words[address];
    const std::string about = block.about();
    reportLine(text, "block",
               fmt::format("{} of 0 to {} (K = {}{}{})", first.block, report.expected.blocks.size() - 1,
                           block.blockSize, about.empty() ? "" : ", ", about));
    reportLine(text, "bit", fmt::format("{} of 0 to {}", first.firstBit, block.blockSize - 1));
    reportLine(text, "expected bit", std::to_string(report.expected.bits[address]));
    reportLine(text, "actual bit", valueText(word) + placeText(word, address));
}

/// What the blocks and bits that differ have in common.
void printGroups(std::string& text, const CompareReport& report) {
    constexpr std::size_t mostGroups = 6;
    for (const Grouping& grouping : groupingsOf(report.expected, report.comparison)) {
        std::vector<std::string> items;
        for (const BlockGroup& group : grouping.groups) {
            if (group.differing > 0) {
                items.push_back(fmt::format("{}: {} of {}", group.name, group.differing, group.blocks));
            }
        }
        reportLine(text, "by " + grouping.property, listText(items, mostGroups));
    }
    reportLine(text, "by place",
               fmt::format("{} bits in the eighths of a block", fmt::join(report.comparison.eighths, " ")));
    if (report.hint) {
        reportLine(text, "hint", report.hint->text);
    }
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
    const bool isEqualSoFar = comparison.failing.empty();
    reportLine(text, "result",
               isEqualSoFar ? "the decisions are equal, but go on after the last" : "the decisions differ");
    if (!isEqualSoFar) {
        printFirst(text, report);
    }
    reportLine(text, "blocks", blocksText(report));
    reportLine(text, "bits", bitsText(report));
    if (comparison.beyond > 0) {
        reportLine(text, "too many",
                   counted(comparison.beyond, "word", "words") + " after the last decision expected");
    }
    if (!isEqualSoFar) {
        printGroups(text, report);
        const std::string& command = report.expected.blocks[comparison.failing.front().block].traceCommand;
        text += command.empty() ? "" : "\nThe model's trace of this block:\n  " + command + '\n';
    }
    stream << text;
}

}  // namespace quarzel::tool
