// SPDX-License-Identifier: MIT
#include "sweep/point_progress.hpp"

#include <algorithm>
#include <utility>

namespace quarzel::sweep {

PointProgress::PointProgress(const Configuration& configuration, const Shard& shard, std::uint64_t mostBlocks,
                             PointState state)
    : itsMostBlockErrors(configuration.maxBlockErrors),
      itsShard(shard),
      itsMostBlocks(mostBlocks),
      itsGroupsDone((state.blocks + blocksPerGroup - 1) / blocksPerGroup),
      itsState(std::move(state)) {
    const std::uint64_t all = (mostBlocks + blocksPerGroup - 1) / blocksPerGroup;
    itsGroups = all > shard.index ? (all - shard.index - 1) / shard.count + 1 : 0;
    if (itsGroups == 0 && !hasStopped()) {
        stop(StopReason::blocks);
    }
}

/// Blocks in the first groups of the shard. Only the last group of a point can be short.
std::uint64_t PointProgress::blocksIn(std::uint64_t groups) const {
    if (groups == 0) {
        return 0;
    }
    const std::uint64_t last = groupNumber(groups - 1) * blocksPerGroup;
    return (groups - 1) * blocksPerGroup + std::min(blocksPerGroup, itsMostBlocks - last);
}

PointState PointProgress::summary() const {
    PointState summary(itsState.counts.size());
    summary.blocks = itsState.blocks;
    summary.counts = itsState.counts;
    summary.bitErrorSquares = itsState.bitErrorSquares;
    summary.stoppedBy = itsState.stoppedBy;
    return summary;
}

void PointProgress::complete(std::uint64_t firstGroup, std::uint64_t groups, ErrorList errors) {
    itsWaiting.emplace(firstGroup, Piece{groups, std::move(errors)});
    while (!hasStopped() && !itsWaiting.empty() && itsWaiting.begin()->first == itsGroupsDone) {
        add(itsWaiting.begin()->second);
        itsWaiting.erase(itsWaiting.begin());
    }
    if (hasStopped()) {
        itsWaiting.clear();
    }
}

void PointProgress::add(const Piece& piece) {
    const std::size_t counts = itsState.counts.size();
    for (std::size_t i = 0; i < piece.errors.size(); ++i) {
        const std::uint64_t block = piece.errors.blocks[i];
        const std::uint32_t* const row = piece.errors.row(i, counts);
        itsState.add(row);
        if (!itsShard.isWhole()) {
            itsState.errors.append(block, row, counts);
        }
        if (row[counts - 1] != 0 && itsState.last().blockErrors == itsMostBlockErrors) {
            const std::uint64_t group = block / blocksPerGroup / itsShard.count;
            itsState.blocks = blocksIn(group) + block % blocksPerGroup + 1;
            stop(StopReason::blockErrors);
            return;
        }
    }
    itsGroupsDone += piece.groups;
    itsState.blocks = blocksIn(itsGroupsDone);
    if (itsGroupsDone == itsGroups) {
        stop(StopReason::blocks);
    }
}

}  // namespace quarzel::sweep
