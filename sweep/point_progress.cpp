// SPDX-License-Identifier: MIT
#include "sweep/point_progress.hpp"

#include <algorithm>
#include <utility>

namespace quarzel::sweep {

PointProgress::PointProgress(const Configuration& configuration, const Shard& shard, std::uint64_t maxBlocks,
                             PointState state)
    : itsMaxBlockErrors(configuration.maxBlockErrors),
      itsShard(shard),
      itsMaxBlocks(maxBlocks),
      itsOctetsDone((state.blocks + blocksPerOctet - 1) / blocksPerOctet),
      itsState(std::move(state)) {
    const std::uint64_t all = (maxBlocks + blocksPerOctet - 1) / blocksPerOctet;
    itsOctets = all > shard.index ? (all - shard.index - 1) / shard.count + 1 : 0;
    if (itsOctets == 0 && !hasStopped()) {
        stop(StopReason::blocks);
    }
}

/// Blocks in the first `octets` octets of the shard. Only the last octet of a point can be short.
std::uint64_t PointProgress::blocksIn(std::uint64_t octets) const {
    if (octets == 0) {
        return 0;
    }
    const std::uint64_t last = octetNumber(octets - 1) * blocksPerOctet;
    return (octets - 1) * blocksPerOctet + std::min(blocksPerOctet, itsMaxBlocks - last);
}

PointState PointProgress::summary() const {
    PointState summary(itsState.counts.size());
    summary.blocks = itsState.blocks;
    summary.counts = itsState.counts;
    summary.bitErrorSquares = itsState.bitErrorSquares;
    summary.stoppedBy = itsState.stoppedBy;
    return summary;
}

void PointProgress::complete(std::uint64_t firstOctet, std::uint64_t octets, ErrorList errors) {
    itsWaiting.emplace(firstOctet, Piece{octets, std::move(errors)});
    while (!hasStopped() && !itsWaiting.empty() && itsWaiting.begin()->first == itsOctetsDone) {
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
        if (row[counts - 1] != 0 && itsState.last().blockErrors == itsMaxBlockErrors) {
            const std::uint64_t octet = block / blocksPerOctet / itsShard.count;
            itsState.blocks = blocksIn(octet) + block % blocksPerOctet + 1;
            stop(StopReason::blockErrors);
            return;
        }
    }
    itsOctetsDone += piece.octets;
    itsState.blocks = blocksIn(itsOctetsDone);
    if (itsOctetsDone == itsOctets) {
        stop(StopReason::blocks);
    }
}

}  // namespace quarzel::sweep
