// SPDX-License-Identifier: MIT
#include "sweep/point_progress.hpp"

#include <algorithm>
#include <utility>

namespace quarzel::sweep {

PointProgress::PointProgress(const StopRule& rule, const Shard& shard, PointState state,
                             std::uint64_t keptFailures)
    : itsRule(rule),
      itsShard(shard),
      itsOctetsDone(state.blocks / blocksPerOctet),
      itsFirstBlock(state.blocks),
      itsState(std::move(state)),
      itsKeptFailures(keptFailures) {
    const std::uint64_t all = (rule.maxBlocks + blocksPerOctet - 1) / blocksPerOctet;
    itsOctets = all > shard.index ? (all - shard.index - 1) / shard.count + 1 : 0;
    const bool hasBlocks = itsState.blocks >= blocksIn(itsOctets);
    const bool hasErrors = rule.maxBlockErrors != 0 && itsState.last().blockErrors >= rule.maxBlockErrors;
    const bool hasTime = rule.maxSeconds != 0 && itsState.stoppedBy == StopReason::time &&
                         itsState.seconds >= static_cast<double>(rule.maxSeconds);
    if (!hasBlocks && !hasErrors && !hasTime) {
        itsState.stoppedBy.reset();
    } else if (!hasStopped()) {
        stop(StopReason::blocks);  // its last block need not be the one with the last error
    }
}

/// Blocks in the first `octets` octets of the shard. Only the last octet of a point can be short.
std::uint64_t PointProgress::blocksIn(std::uint64_t octets) const {
    if (octets == 0) {
        return 0;
    }
    const std::uint64_t last = ((octets - 1) * itsShard.count + itsShard.index) * blocksPerOctet;
    return (octets - 1) * blocksPerOctet + std::min(blocksPerOctet, itsRule.maxBlocks - last);
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
        if (block < itsFirstBlock || block >= itsRule.maxBlocks) {
            continue;
        }
        const std::uint32_t* const row = piece.errors.row(i, itsState.columns());
        itsState.add(row);
        if (row[counts - 1] != 0 && itsFailures.size() < itsKeptFailures) {
            itsFailures.push_back({block, row[counts - 1] & ~(undetectedMark | rejectedMark)});
        }
        if (row[counts - 1] != 0 && itsState.last().blockErrors == itsRule.maxBlockErrors) {
            itsState.blocks = block + 1;
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
