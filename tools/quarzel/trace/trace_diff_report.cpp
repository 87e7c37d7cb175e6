// SPDX-License-Identifier: MIT
#include "trace/trace_diff_report.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <string_view>

#include "report_text.hpp"
#include "trace/trace_context.hpp"

namespace quarzel::tool {

namespace {

/// What the lines behind a label begin with.
constexpr const char* indent = "              ";

std::string meaningOf(unsigned column) {
    const auto& [signal, description, number] = traceColumns()[column];
    if (!number) {
        return description;
    }
    return signal == std::string_view("g") ? description
                                           : fmt::format("{} of state {}", description, *number);
}

std::string passText(std::optional<std::uint32_t> pass) {
    if (!pass) {
        return "none: soft inputs of the block";
    }
    const unsigned code = constituentCode(*pass);
    return fmt::format("{}: constituent code {} in {} order", *pass, code,
                       code == 1 ? "natural" : "interleaved");
}

std::string blockText(const TraceDifference& first) {
    const auto text = [](const std::shared_ptr<const TraceBlock>& block) {
        return block->number() ? std::to_string(*block->number()) : "without a number";
    };
    return first.blocks[0]->number() == first.blocks[1]->number()
               ? text(first.blocks[0])
               : fmt::format("{} in A, {} in B", text(first.blocks[0]), text(first.blocks[1]));
}

std::string valueText(const TraceDiffReport& report, std::size_t trace) {
    const TraceDifference& first = *report.comparison.first;
    const TraceValue value = first.value(trace);
    const std::size_t line = first.blocks[trace]->table(first.pass)->line(first.step, first.column);
    const std::string place = fmt::format("{} {}", report.units[trace], line);
    return value.isNumber() ? fmt::format("{:+.6f}, raw {}, {}", value.real(), value.raw(), place)
                            : fmt::format("{}, {}", value.text(), place);
}

void printFirstValue(std::string& text, const TraceDiffReport& report) {
    const TraceDifference& first = *report.comparison.first;
    reportLine(text, "block", blockText(first));
    reportLine(text, "pass", passText(first.pass));
    reportLine(text, "step", fmt::format("{} of 0 to {}", first.step, first.steps - 1));
    reportLine(text, "signal",
               fmt::format("{}: {}", traceColumns()[first.column].heading(), meaningOf(first.column)));
    reportLine(text, "value in A", valueText(report, 0));
    reportLine(text, "value in B", valueText(report, 1));
}

/// What a trace has where the other one has nothing, or something else.
std::string whatComes(const TraceDifference& first, std::size_t trace) {
    const auto& block = first.blocks[trace];
    if (!block) {
        return "nothing, it has ended";
    }
    if (first.steps == 0) {
        return block->number() ? fmt::format("block {}", *block->number()) : "a block without a number";
    }
    return block->table(first.pass) != nullptr ? tableName(block->number(), first.pass)
                                               : "no " + tableName(block->number(), first.pass);
}

void printCounts(std::string& text, const TraceComparison& comparison) {
    reportLine(
        text, "differ",
        fmt::format("{} of {}", comparison.differing(), counted(comparison.values, "value", "values")));
    std::vector<std::string> signals;
    for (const auto& [signal, count] : differencesBySignal(comparison)) {
        signals.push_back(fmt::format("{} {}", signal, count));
    }
    reportLine(text, "by signal", fmt::format("{}", fmt::join(signals, ", ")));
    constexpr std::size_t mostTables = 8;
    std::size_t shown = 0;
    for (const auto& [table, count] : comparison.byTable) {
        if (shown++ == mostTables) {
            text += fmt::format("{}and {} more passes\n", indent, comparison.byTable.size() - mostTables);
            break;
        }
        const auto& [block, pass] = table;
        reportLine(text, shown == 1 ? "by pass" : "", fmt::format("{}: {}", tableName(block, pass), count));
    }
}

/// In what way the traces are equal or not.
std::string resultText(const TraceComparison& comparison) {
    const auto& first = comparison.first;
    if (!first) {
        return comparison.termination == 0 ? "the traces are equal"
                                           : "the traces are equal but for termination steps";
    }
    if (first->isValue) {
        return comparison.elsewhere ? "the traces differ" : "the traces differ in termination steps alone";
    }
    for (const std::size_t trace : {0U, 1U}) {
        const auto& block = first->blocks[trace];
        if (!block || (first->steps != 0 && block->table(first->pass) == nullptr)) {
            return fmt::format("the traces differ: {} lacks something", trace == 0 ? 'A' : 'B');
        }
    }
    return "the traces differ: they go on with different blocks";
}

std::string signalsText(const TraceColumnSet& columns) {
    std::vector<std::string> names;
    for (const unsigned column : columnsAsComputed()) {
        const std::string name = isInput(column) ? "soft inputs" : traceColumns()[column].signal;
        if (columns[column] && (names.empty() || names.back() != name)) {
            names.push_back(name);
        }
    }
    return fmt::format("{}", fmt::join(names, ", "));
}

}  // namespace

std::vector<std::pair<std::string, std::size_t>> differencesBySignal(const TraceComparison& comparison) {
    std::vector<std::pair<std::string, std::size_t>> counts;
    for (const unsigned column : columnsAsComputed()) {
        const auto found = comparison.byColumn.find(column);
        if (found == comparison.byColumn.end()) {
            continue;
        }
        const char* const signal = traceColumns()[column].signal;
        if (counts.empty() || counts.back().first != signal) {
            counts.emplace_back(signal, 0);
        }
        counts.back().second += found->second;
    }
    return counts;
}

void printText(std::ostream& stream, const TraceDiffReport& report) {
    const TraceComparison& comparison = report.comparison;
    const auto& first = comparison.first;
    std::string text;
    reportLine(text, "A", report.files[0]);
    reportLine(text, "B", report.files[1]);
    reportLine(text, "result", resultText(comparison));
    reportLine(text, "compared",
               fmt::format("{}, {}: {}", counted(comparison.blocks, "block", "blocks"),
                           counted(comparison.passes, "pass", "passes"), signalsText(comparison.columns)));
    if (first && !first->isValue) {
        reportLine(text, "next in A", whatComes(*first, 0));
        reportLine(text, "next in B", whatComes(*first, 1));
    } else if (first) {
        printFirstValue(text, report);
    } else if (comparison.termination > 0) {
        reportLine(text, "ignored",
                   fmt::format("{} of termination steps",
                               counted(comparison.termination, "value that differs", "values that differ")));
    }
    if (!comparison.byColumn.empty()) {
        printCounts(text, comparison);
    }
    if (first && first->isTermination()) {
        reportLine(text, "note",
                   fmt::format("hardware does not compute the termination steps, which hold every\n"
                               "{}difference of these traces; see --ignore-termination",
                               indent));
    }
    for (std::size_t i = 0; i < report.cause.size(); ++i) {
        reportLine(text, i == 0 ? "recomputed" : "", report.cause[i]);
    }
    if (first && first->isValue) {
        appendContext(text, *first);
    }
    stream << text;
}

}  // namespace quarzel::tool
