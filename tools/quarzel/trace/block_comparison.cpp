// SPDX-License-Identifier: MIT
#include "trace/block_comparison.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <set>
#include <span>
#include <string_view>

#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

using PassNumber = std::optional<std::uint32_t>;

class BlockComparison {
  public:
    BlockComparison(const TraceBlockPair& blocks, const std::array<const TraceRowReader*, 2>& readers,
                    const TraceMatching& matching, TraceComparison& result)
        : itsBlocks(blocks), itsReaders(readers), itsMatching(matching), itsResult(result) {}

    void run() {
        requireWholeBlocks();
        const std::set<PassNumber> tables = tablesToCompare();
        findColumns(tables);
        itsResult.columns |= itsColumns;
        ++itsResult.blocks;
        for (const PassNumber pass : tables) {
            compareTable(pass);
        }
    }

  private:
    void requireWholeBlocks() {
        const std::optional<std::uint32_t> steps = itsBlocks[0]->steps();
        if (!steps) {
            throw fileError(
                itsReaders[0]->name(),
                fmt::format(
                    "ends with step {} in {}", itsBlocks[0]->highestStep(),
                    itsBlocks[0]->number() ? fmt::format("block {}", *itsBlocks[0]->number()) : "its block"),
                "expected steps 0 to K - 1 of a valid K, or to K + 2 with the termination steps");
        }
        itsSteps = *steps;
        for (const std::size_t trace : {0U, 1U}) {
            requireWhole(*itsBlocks[trace], itsSteps, itsMatching.ignoreTermination, *itsReaders[trace]);
        }
    }

    /// The tables of either block from the first one that both can have; soft inputs where both have them.
    std::set<PassNumber> tablesToCompare() const {
        const auto isWanted = [this](PassNumber pass) { return itsMatching.selection.wants(pass); };
        std::set<PassNumber> all;
        PassNumber start = 0;
        for (const auto& block : itsBlocks) {
            PassNumber first;
            for (const auto& [pass, table] : block->tables()) {
                if (pass && isWanted(pass)) {
                    first = first ? first : pass;
                    all.insert(pass);
                }
            }
            start = std::max(start, first);
        }
        all.erase(all.begin(), all.lower_bound(start));
        if (itsBlocks[0]->table({}) != nullptr && itsBlocks[1]->table({}) != nullptr) {
            all.insert(PassNumber());
        }
        for (const std::size_t trace : {0U, 1U}) {
            for (const std::uint32_t pass : itsMatching.selection.passes) {
                if (itsBlocks[trace]->table(pass) == nullptr) {
                    throw fileError(itsReaders[trace]->name(),
                                    "has no " + tableName(itsBlocks[trace]->number(), pass),
                                    "give passes that both traces have");
                }
            }
        }
        return all;
    }

    /// The columns that both blocks have and the user wants.
    void findColumns(const std::set<PassNumber>& tables) {
        const TraceSelection& selection = itsMatching.selection;
        for (unsigned column = 0; column < traceColumns().size(); ++column) {
            const bool isTold = itsBlocks[0]->columns()[column] && itsBlocks[1]->columns()[column];
            itsColumns[column] = isTold && selection.wants(column);
            if (!isTold && selection.columns[column] && !hasSibling(column)) {
                const std::size_t lacking = itsBlocks[0]->columns()[column] ? 1 : 0;
                throw fileError(itsReaders[lacking]->name(),
                                fmt::format("has no {}", traceColumns()[column].heading()),
                                "give signals that both traces have");
            }
        }
        if (itsColumns.none() || tables.empty()) {
            throw fileError(itsReaders[1]->name(),
                            fmt::format("has nothing to compare with {}", itsReaders[0]->name()),
                            "expected values of the same signals and passes");
        }
    }

    /// Whether another wanted column of the same signal is told by both.
    bool hasSibling(unsigned column) const {
        const TraceColumnSet siblings = columnsNamed(traceColumns()[column].signal);
        return (siblings & itsMatching.selection.columns & itsBlocks[0]->columns() & itsBlocks[1]->columns())
            .any();
    }

    void compareTable(PassNumber pass) {
        const std::array<const TraceTable*, 2> tables = {itsBlocks[0]->table(pass),
                                                         itsBlocks[1]->table(pass)};
        if (tables[0] == nullptr || tables[1] == nullptr) {
            itsResult.elsewhere = true;
            keepFirst({itsBlocks, pass, itsSteps, false, 0, 0});
            return;
        }
        itsResult.passes += pass ? 1 : 0;
        // Step by step within a signal, as the core computes its values together.
        const std::vector<unsigned>& order = columnsAsComputed();
        for (auto from = order.begin(); from != order.end();) {
            const auto to = std::find_if(from, order.end(), [from](unsigned column) {
                return std::string_view(traceColumns()[column].signal) != traceColumns()[*from].signal;
            });
            if (isInput(*from) != pass.has_value()) {
                compareSignal(tables, pass, {from, to});
            }
            from = to;
        }
    }

    void compareSignal(const std::array<const TraceTable*, 2>& tables, PassNumber pass,
                       std::span<const unsigned> columns) {
        for (std::uint32_t i = 0; i < itsSteps; ++i) {
            const std::uint32_t step = isComputedDownwards(columns[0]) ? itsSteps - 1 - i : i;
            for (const unsigned column : columns) {
                if (itsColumns[column]) {
                    compareValue(tables, {pass, step, column});
                }
            }
        }
    }

    struct Place {
        PassNumber pass;
        std::uint32_t step;
        unsigned column;
    };

    void compareValue(const std::array<const TraceTable*, 2>& tables, const Place& place) {
        const TraceValue a = tables[0]->value(place.step, place.column);
        const TraceValue b = tables[1]->value(place.step, place.column);
        const bool isTermination = place.pass && place.step + terminationSteps >= itsSteps;
        if (isTermination && (!a.isThere() || !b.isThere())) {
            return;
        }
        const bool isIgnored = isTermination && itsMatching.ignoreTermination;
        itsResult.values += isIgnored ? 0 : 1;
        if (a == b) {
            return;
        }
        itsResult.termination += isTermination ? 1 : 0;
        if (isIgnored) {
            return;
        }
        ++itsResult.byColumn[place.column];
        ++itsResult.byTable[{itsBlocks[0]->number(), place.pass}];
        keepFirst({itsBlocks, place.pass, itsSteps, true, place.step, place.column});
        itsResult.elsewhere = itsResult.elsewhere || !isTermination;
    }

    void keepFirst(const TraceDifference& difference) {
        const auto& first = itsResult.first;
        if (!first || (first->isTermination() && !difference.isTermination())) {
            itsResult.first = difference;
        }
    }

    const TraceBlockPair& itsBlocks;
    const std::array<const TraceRowReader*, 2>& itsReaders;
    const TraceMatching& itsMatching;
    TraceComparison& itsResult;
    std::uint32_t itsSteps = 0;
    TraceColumnSet itsColumns;
};

}  // namespace

void compareBlocks(const TraceBlockPair& blocks, const std::array<const TraceRowReader*, 2>& readers,
                   const TraceMatching& matching, TraceComparison& result) {
    BlockComparison(blocks, readers, matching, result).run();
}

}  // namespace quarzel::tool
