// SPDX-License-Identifier: MIT
#include "trace/trace_difference.hpp"

#include <algorithm>
#include <utility>

namespace quarzel::tool {

namespace {

bool haveSamePlace(const TraceTable& a, const TraceTable& b) {
    return a.decode == b.decode && a.siso == b.siso && a.steps == b.steps;
}

/// Values of two tables that differ.
struct Differences {
    std::optional<std::size_t> first;
    std::size_t elsewhere = 0;    ///< in steps of information bits, or in soft inputs
    std::size_t termination = 0;  ///< in termination steps
};

/// Compare the rows that both tables have: one may lack its termination steps.
Differences differencesOf(const TraceTable& a, const TraceTable& b, bool ignoreTermination) {
    Differences found;
    for (std::size_t index = 0; index < std::min(a.values.size(), b.values.size()); ++index) {
        if (a.values[index] == b.values[index]) {
            continue;
        }
        const bool isTermination = a.isTermination(index);
        ++(isTermination ? found.termination : found.elsewhere);
        if (!found.first && !(isTermination && ignoreTermination)) {
            found.first = index;
        }
    }
    return found;
}

}  // namespace

TraceComparison compareTraces(TraceReader& a, TraceReader& b, bool ignoreTermination) {
    TraceComparison result;
    const auto keepFirst = [&result](TraceDifference difference) {
        if (!result.first) {
            result.first = std::move(difference);
        }
    };
    while (!result.elsewhere) {
        std::optional<TraceTable> tableA = a.next();
        std::optional<TraceTable> tableB = b.next();
        if (!tableA && !tableB) {
            break;
        }
        if (!tableA || !tableB || !haveSamePlace(*tableA, *tableB)) {
            result.elsewhere = true;
            keepFirst({std::move(tableA), std::move(tableB), std::nullopt, 0});
            break;
        }
        ++(tableA->siso ? result.passes : result.blocks);
        const Differences found = differencesOf(*tableA, *tableB, ignoreTermination);
        result.termination += found.termination;
        result.elsewhere = found.elsewhere > 0;
        if (found.first) {
            const std::size_t values = found.elsewhere + (ignoreTermination ? 0 : found.termination);
            keepFirst({std::move(tableA), std::move(tableB), found.first, values});
        }
    }
    return result;
}

}  // namespace quarzel::tool
