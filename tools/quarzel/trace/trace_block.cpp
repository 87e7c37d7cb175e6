// SPDX-License-Identifier: MIT
#include "trace/trace_block.hpp"

#include <fmt/format.h>

#include <algorithm>

#include "tool_error.hpp"

namespace quarzel::tool {

TraceValue TraceTable::value(std::uint32_t step, unsigned column) const {
    return step < steps() ? itsValues[indexOf(step, column)] : TraceValue();
}

void TraceTable::set(std::uint32_t step, unsigned column, TraceValue value, std::size_t line) {
    if (step >= steps()) {
        itsValues.resize((std::size_t{step} + 1) * itsWidth);
        itsLines.resize(itsValues.size());
    }
    itsValues[indexOf(step, column)] = value;
    itsLines[indexOf(step, column)] = static_cast<std::uint32_t>(line);
    itsFirstLine = std::min(itsFirstLine, line);
    itsLastLine = std::max(itsLastLine, line);
}

bool TraceBlock::add(std::optional<std::uint32_t> pass, std::uint32_t step, unsigned column, TraceValue value,
                     std::size_t line) {
    const bool isSoftInput = isInput(column);
    const auto columnsOfPass = static_cast<unsigned>(passColumns().size());
    TraceTable& table = itsTables
                            .try_emplace(isSoftInput ? std::nullopt : pass, isSoftInput ? columnsOfPass : 0,
                                         isSoftInput ? traceStreams.size() : columnsOfPass)
                            .first->second;
    const TraceValue old = table.value(step, column);
    if (old.isThere()) {
        return old == value;
    }
    table.set(step, column, value, line);
    itsColumns[column] = true;
    return true;
}

const TraceTable* TraceBlock::table(std::optional<std::uint32_t> pass) const {
    const auto found = itsTables.find(pass);
    return found == itsTables.end() ? nullptr : &found->second;
}

TraceValue TraceBlock::value(std::optional<std::uint32_t> pass, std::uint32_t step, unsigned column) const {
    const TraceTable* const found = table(isInput(column) ? std::nullopt : pass);
    return found == nullptr ? TraceValue() : found->value(step, column);
}

std::uint32_t TraceBlock::highestStep() const {
    std::uint32_t most = 0;
    for (const auto& [pass, table] : itsTables) {
        most = std::max(most, table.steps());
    }
    return most - 1;
}

std::optional<std::uint32_t> TraceBlock::steps() const {
    const std::uint32_t told = highestStep() + 1;
    if (told > terminationSteps && findBlockSize(told - terminationSteps)) {
        return told;
    }
    return findBlockSize(told) ? std::optional(told + terminationSteps) : std::nullopt;
}

std::string tableName(std::optional<std::uint64_t> block, std::optional<std::uint32_t> pass) {
    const std::string of = block ? fmt::format(" of block {}", *block) : "";
    return pass ? fmt::format("pass {}{}", *pass, of) : "soft inputs" + of;
}

void requireWhole(const TraceBlock& block, std::uint32_t steps, bool terminationOptional,
                  const TraceRowReader& reader) {
    const auto fail = [&](std::optional<std::uint32_t> pass, const TraceTable& table,
                          const std::string& what) {
        throw fileError(reader.name(),
                        fmt::format("{}s {} to {} hold {} {}", reader.unit(), table.firstLine(),
                                    table.lastLine(), tableName(block.number(), pass), what),
                        fmt::format("expected steps 0 to {}{}", steps - 1,
                                    terminationOptional ? "" : ", with the termination steps"));
    };
    for (const auto& [pass, table] : block.tables()) {
        if (table.steps() > steps) {
            fail(pass, table, fmt::format("with step {}", table.steps() - 1));
        }
        for (unsigned column = 0; column < traceColumns().size(); ++column) {
            if (!block.columns()[column] || isInput(column) == pass.has_value()) {
                continue;
            }
            std::uint32_t step = 0;
            while (step < steps && table.value(step, column).isThere()) {
                ++step;
            }
            if (step != steps && !(terminationOptional && step == steps - terminationSteps)) {
                fail(pass, table,
                     fmt::format("without {} of step {}", traceColumns()[column].heading(), step));
            }
        }
    }
}

}  // namespace quarzel::tool
