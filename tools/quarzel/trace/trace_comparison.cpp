// SPDX-License-Identifier: MIT
#include "trace/trace_comparison.hpp"

#include <numeric>

#include "trace/block_comparison.hpp"

namespace quarzel::tool {

namespace {

std::shared_ptr<const TraceBlock> nextOf(TraceBlockReader& reader) {
    std::optional<TraceBlock> block = reader.next();
    return block ? std::make_shared<const TraceBlock>(std::move(*block)) : nullptr;
}

}  // namespace

std::size_t TraceComparison::differing() const {
    return std::accumulate(byColumn.begin(), byColumn.end(), std::size_t{0},
                           [](std::size_t sum, const auto& entry) { return sum + entry.second; });
}

TraceComparison compareTraces(TraceBlockReader& a, TraceBlockReader& b, const TraceMatching& matching) {
    TraceComparison result;
    const auto compare = [&](const TraceBlockPair& blocks) {
        compareBlocks(blocks, {&a.rows(), &b.rows()}, matching, result);
    };
    if (matching.block) {
        compare({std::make_shared<const TraceBlock>(a.choose(*matching.block)),
                 std::make_shared<const TraceBlock>(b.choose(*matching.block))});
        return result;
    }
    TraceBlockPair blocks = {nextOf(a), nextOf(b)};
    TraceBlockPair following = {nextOf(a), nextOf(b)};
    if (!following[0] && !following[1]) {
        // One block each: whatever their numbers, they are meant for each other.
        compare(blocks);
        return result;
    }
    const auto advance = [&](std::size_t trace) {
        blocks[trace] = std::exchange(following[trace], nextOf(trace == 0 ? a : b));
    };
    while (blocks[0] && blocks[1] && blocks[0]->number() != blocks[1]->number()) {
        advance(blocks[0]->number() < blocks[1]->number() ? 0 : 1);
    }
    while (blocks[0] && blocks[1] && blocks[0]->number() == blocks[1]->number()) {
        compare(blocks);
        advance(0);
        advance(1);
    }
    if (blocks[0] || blocks[1]) {
        result.elsewhere = true;
        if (!result.first || result.first->isTermination()) {
            result.first = TraceDifference{blocks, {}, 0, false, 0, 0};
        }
    }
    return result;
}

}  // namespace quarzel::tool
