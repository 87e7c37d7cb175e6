// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <map>

#include "sweep/configuration.hpp"
#include "sweep/point_state.hpp"

namespace quarzel::sweep {

/// Puts the blocks of a point in their order as they come in, and finds where the point ends: the stop rule
/// looks at blocks in their order, so it is the same block whoever simulated it and whenever.
class PointProgress {
  public:
    /// @param mostBlocks  blocks of the point in all shards
    /// @param state       where to go on
    PointProgress(const Configuration& configuration, const Shard& shard, std::uint64_t mostBlocks,
                  PointState state);

    /// Groups of the shard, in all.
    std::uint64_t groups() const { return itsGroups; }

    /// The first group of the shard that is not done.
    std::uint64_t groupsDone() const { return itsGroupsDone; }

    /// Take in the blocks in error of some groups, which need not be next.
    void complete(std::uint64_t firstGroup, std::uint64_t groups, ErrorList errors);

    /// End the point where it is.
    void stop(StopReason reason) { itsState.stoppedBy = reason; }
    bool hasStopped() const { return itsState.stoppedBy.has_value(); }

    const PointState& state() const { return itsState; }

    /// The state without its list of errors.
    PointState summary() const;

    void setSeconds(double seconds) { itsState.seconds = seconds; }

  private:
    struct Piece {
        std::uint64_t groups;
        ErrorList errors;
    };

    void add(const Piece& piece);
    std::uint64_t groupNumber(std::uint64_t group) const { return group * itsShard.count + itsShard.index; }
    std::uint64_t blocksIn(std::uint64_t groups) const;

    std::uint64_t itsMostBlockErrors;
    Shard itsShard;
    std::uint64_t itsMostBlocks;
    std::uint64_t itsGroups;
    std::uint64_t itsGroupsDone;
    PointState itsState;
    std::map<std::uint64_t, Piece> itsWaiting;  ///< by first group: not next yet
};

}  // namespace quarzel::sweep
