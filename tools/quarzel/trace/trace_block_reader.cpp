// SPDX-License-Identifier: MIT
#include "trace/trace_block_reader.hpp"

#include <fmt/format.h>

#include "tool_error.hpp"

namespace quarzel::tool {

/// Add the row that comes next to its block.
void TraceBlockReader::add(TraceBlock& block) const {
    const std::string place = fmt::format("{} {}", itsRows->unit(), itsRow.line);
    const std::uint32_t steps = blockSizes().back().K + terminationSteps;
    if (itsRow.step >= steps) {
        throw fileError(itsRows->name(), fmt::format("{} is of step {}", place, itsRow.step),
                        fmt::format("expected a step from 0 to {}", steps - 1));
    }
    for (const auto& [column, value] : itsRow.values) {
        if (!block.add(itsRow.pass, itsRow.step, column, value, itsRow.line)) {
            throw fileError(
                itsRows->name(),
                fmt::format("{} tells {} of step {} in {} again, with another value", place,
                            traceColumns()[column].heading(), itsRow.step,
                            tableName(block.number(), isInput(column) ? std::nullopt : itsRow.pass)),
                "expected each value once");
        }
    }
}

std::optional<TraceBlock> TraceBlockReader::next() {
    if (!itsHasBegun) {
        itsHasBegun = true;
        readRow();
        if (!itsHasRow) {
            throw fileError(itsRows->name(), "holds no value", "expected rows of a trace");
        }
    }
    if (!itsHasRow) {
        return std::nullopt;
    }
    TraceBlock block(itsRow.block);
    if (!itsNumbers.insert(block.number()).second) {
        throw fileError(
            itsRows->name(),
            fmt::format("{} {} goes on with {}, after rows of others", itsRows->unit(), itsRow.line,
                        block.number() ? fmt::format("block {}", *block.number()) : "no block"),
            "expected the rows of a block together; choose one with --block");
    }
    while (itsHasRow && itsRow.block == block.number()) {
        add(block);
        readRow();
    }
    return block;
}

TraceBlock TraceBlockReader::choose(std::uint64_t number) {
    std::optional<TraceBlock> chosen;
    std::optional<TraceBlock> first;
    bool hasOthers = false;
    for (readRow(); itsHasRow; readRow()) {
        std::optional<TraceBlock>& block = itsRow.block == number ? chosen : first;
        if (!block) {
            block.emplace(itsRow.block);
        }
        if (block->number() == itsRow.block) {
            add(*block);
        } else {
            hasOthers = true;
        }
    }
    if (!chosen && !hasOthers) {
        chosen = std::move(first);
    }
    if (!chosen) {
        throw fileError(itsRows->name(),
                        fmt::format("holds {}", first ? fmt::format("no block {}", number) : "no value"),
                        "give a block that it holds; they count from 0");
    }
    return std::move(*chosen);
}

}  // namespace quarzel::tool
