// SPDX-License-Identifier: MIT
#include "trace/trace_context.hpp"

#include <fmt/format.h>

#include <algorithm>

namespace quarzel::tool {

namespace {

/// Steps shown before and after the one that differs.
constexpr std::uint32_t contextSteps = 3;

void endRow(std::string& text) {
    text.resize(text.find_last_not_of(' ') + 1);
    text += '\n';
}

}  // namespace

void appendContext(std::string& text, const TraceDifference& difference) {
    const TraceColumnSet columns = columnsNamed(traceColumns()[difference.column].signal);
    const std::size_t width =
        std::max<std::size_t>(7, traceColumns()[difference.column].heading().size() + 1);
    const auto forEachColumn = [&columns](const auto& append) {
        for (unsigned column = 0; column < columns.size(); ++column) {
            if (columns[column]) {
                append(column);
            }
        }
    };
    text += "\nstep   raw";
    forEachColumn(
        [&](unsigned column) { text += fmt::format("{:>{}}", traceColumns()[column].heading(), width); });
    text += '\n';
    const std::uint32_t step = difference.step;
    const std::uint32_t end = std::min(difference.steps, step + contextSteps + 1);
    for (std::uint32_t s = step - std::min(step, contextSteps); s < end; ++s) {
        for (const std::size_t trace : {0U, 1U}) {
            text += fmt::format("{:4}  {}   ", s, trace == 0 ? 'A' : 'B');
            forEachColumn([&](unsigned column) {
                const TraceValue a = difference.blocks[0]->value(difference.pass, s, column);
                const TraceValue b = difference.blocks[1]->value(difference.pass, s, column);
                const bool isMarked = trace == 1 && a.isThere() && b.isThere() && !(a == b);
                text += fmt::format("{:>{}}", (isMarked ? "*" : "") + (trace == 0 ? a : b).text(), width);
            });
            endRow(text);
        }
    }
}

}  // namespace quarzel::tool
