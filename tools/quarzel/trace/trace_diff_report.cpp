// SPDX-License-Identifier: MIT
#include "trace/trace_diff_report.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <iterator>
#include <string_view>
#include <vector>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

/// Steps shown before and after the one that differs.
constexpr std::size_t contextSteps = 3;

std::string valuesThatDiffer(std::size_t number, std::string_view where) {
    return fmt::format("{} of {} {}", counted(number, "value", "values"), where,
                       number == 1 ? "differs" : "differ");
}

/// The element of the core's record of branch metrics that is in the column g4, g5, g6 or g7.
unsigned branchElement(unsigned column) {
    constexpr std::array<unsigned, 4> elements = {2, 1, 3, 0};
    return elements[column - 4];
}

std::string meaningOf(const TraceTable& table, std::size_t column) {
    const auto [signal, description, number] = table.column(column);
    if (!number) {
        return description;
    }
    return signal == std::string_view("g")
               ? fmt::format("{}, element {}", description, branchElement(*number))
               : fmt::format("{} of state {}", description, *number);
}

/// The columns that belong to the signal of a column.
std::vector<std::size_t> columnsOfSignal(const TraceTable& table, std::size_t column) {
    if (!table.siso) {
        return {column};
    }
    std::vector<std::size_t> columns;
    for (std::size_t other = 0; other < passColumns().size(); ++other) {
        if (std::string_view(passColumns()[other].signal) == passColumns()[column].signal) {
            columns.push_back(other);
        }
    }
    return columns;
}

std::string placeText(const TraceTable& table) {
    const std::string block =
        fmt::format("block {} (decode={}, {} steps)", blockNumber(table), table.decode, table.steps);
    return table.siso ? fmt::format("pass {} of {}", *table.siso, block) : "soft inputs of " + block;
}

/// What a trace has where the other one has something else.
std::string whatComes(const std::optional<TraceTable>& table, std::size_t lines) {
    return table ? fmt::format("{}, from line {}", placeText(*table), table->firstLine)
                 : fmt::format("nothing, it ends after line {}", lines);
}

void endRow(std::string& text) {
    text.resize(text.find_last_not_of(' ') + 1);
    text += '\n';
}

/// The signal that differs around the step where it does: a row of A and one of B for each step.
void printContext(std::string& text, const TraceTable& a, const TraceTable& b, std::size_t index) {
    const std::vector<std::size_t> columns = columnsOfSignal(a, a.columnOf(index));
    const std::size_t steps =
        std::min(a.values.size(), b.values.size()) / (a.siso ? a.rowLength() : traceStreams.size());
    const std::size_t step = a.stepOf(index);
    text += "\nstep    ";
    for (const std::size_t column : columns) {
        fmt::format_to(std::back_inserter(text), " {:12}", a.column(column).heading());
    }
    endRow(text);
    for (std::size_t s = step - std::min(step, contextSteps); s < std::min(steps, step + contextSteps + 1);
         ++s) {
        for (const bool isA : {true, false}) {
            fmt::format_to(std::back_inserter(text), "{:4}  {} ", s, isA ? 'A' : 'B');
            for (const std::size_t column : columns) {
                const double realA = a.real(a.indexOf(s, column));
                const double realB = b.real(b.indexOf(s, column));
                fmt::format_to(std::back_inserter(text), "{}{:<+12.6f}", isA || realA == realB ? ' ' : '*',
                               isA ? realA : realB);
            }
            endRow(text);
        }
    }
}

std::string valueText(const TraceTable& table, std::size_t index) {
    return fmt::format("{:+.6f}, raw {}, line {}", table.real(index), table.raw(index), table.lineOf(index));
}

void printFirstValue(std::string& text, const TraceDifference& first) {
    const TraceTable& a = *first.a;
    const TraceTable& b = *first.b;
    const std::size_t index = *first.index;
    const std::size_t column = a.columnOf(index);
    reportLine(text, "block", fmt::format("{} (decode={})", blockNumber(a), a.decode));
    if (a.siso) {
        const unsigned code = constituentCode(*a.siso);
        reportLine(text, "pass",
                   fmt::format("{}: constituent code {} in {} order", *a.siso, code,
                               code == 1 ? "natural" : "interleaved"));
    } else {
        reportLine(text, "pass", "none: soft inputs of the block");
    }
    reportLine(text, "step", fmt::format("{} of 0 to {}", a.stepOf(index), a.steps - 1));
    reportLine(text, "signal", fmt::format("{}: {}", a.column(column).heading(), meaningOf(a, column)));
    reportLine(text, "value in A", valueText(a, index));
    reportLine(text, "value in B", valueText(b, index));
    reportLine(text, "further",
               valuesThatDiffer(first.values - 1, a.siso ? "this pass" : "these soft inputs"));
}

/// In what way the traces are equal or not.
std::string resultText(const TraceComparison& comparison) {
    const auto& first = comparison.first;
    if (!first) {
        return comparison.termination == 0 ? "the traces are equal"
                                           : "the traces are equal but for termination steps";
    }
    if (first->index) {
        return comparison.elsewhere ? "the traces differ" : "the traces differ in termination steps alone";
    }
    return first->a && first->b ? "the traces differ: they go on with different tables"
                                : fmt::format("the traces differ: {} ends first", first->a ? 'B' : 'A');
}

}  // namespace

void printText(std::ostream& stream, const TraceDiffReport& report) {
    const TraceComparison& comparison = report.comparison;
    const auto& first = comparison.first;
    std::string text;
    reportLine(text, "A", report.fileA);
    reportLine(text, "B", report.fileB);
    reportLine(text, "result", resultText(comparison));
    if (!first) {
        reportLine(text, "compared",
                   counted(comparison.blocks, "block", "blocks") + ", " +
                       counted(comparison.passes, "pass", "passes"));
    } else if (first->index) {
        printFirstValue(text, *first);
    } else {
        reportLine(text, "next in A", whatComes(first->a, report.linesA));
        reportLine(text, "next in B", whatComes(first->b, report.linesB));
    }
    if (!first && comparison.termination > 0) {
        reportLine(text, "ignored", valuesThatDiffer(comparison.termination, "termination steps"));
    } else if (first && first->isTermination()) {
        reportLine(text, "note",
                   comparison.elsewhere
                       ? "a termination step, which hardware does not compute; the traces\n"
                         "              differ elsewhere too, --ignore-termination tells where"
                       : "termination steps, which hardware does not compute, hold every\n"
                         "              difference of these traces; see --ignore-termination");
    }
    if (first && first->index) {
        printContext(text, *first->a, *first->b, *first->index);
    }
    stream << text;
}

}  // namespace quarzel::tool
