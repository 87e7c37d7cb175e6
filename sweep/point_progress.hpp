// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <map>

#include "sweep/configuration.hpp"
#include "sweep/point_state.hpp"

namespace quarzel::sweep {

/// Puts the blocks of a point in order as they come in, and finds where the point ends. The stop rule looks
/// at blocks in order, so a point ends at the same block whoever simulates it and whenever.
class PointProgress {
  public:
    /// @param maxBlocks  blocks of the point in all shards
    /// @param state      where to go on
    PointProgress(const Configuration& configuration, const Shard& shard, std::uint64_t maxBlocks,
                  PointState state);

    /// Octets in the shard.
    std::uint64_t octets() const { return itsOctets; }

    /// The first octet of the shard that is not done.
    std::uint64_t octetsDone() const { return itsOctetsDone; }

    /// Take in the blocks in error of some octets, which may be ahead of the next ones.
    void complete(std::uint64_t firstOctet, std::uint64_t octets, ErrorList errors);

    /// End the point where it is.
    void stop(StopReason reason) { itsState.stoppedBy = reason; }
    bool hasStopped() const { return itsState.stoppedBy.has_value(); }

    const PointState& state() const { return itsState; }

    /// The state without its list of errors.
    PointState summary() const;

    void setSeconds(double seconds) { itsState.seconds = seconds; }

  private:
    struct Piece {
        std::uint64_t octets;
        ErrorList errors;
    };

    void add(const Piece& piece);
    std::uint64_t octetNumber(std::uint64_t octet) const { return octet * itsShard.count + itsShard.index; }
    std::uint64_t blocksIn(std::uint64_t octets) const;

    std::uint64_t itsMaxBlockErrors;
    Shard itsShard;
    std::uint64_t itsMaxBlocks;
    std::uint64_t itsOctets;
    std::uint64_t itsOctetsDone;
    PointState itsState;
    std::map<std::uint64_t, Piece> itsWaiting;  ///< by first octet: ahead of the next ones
};

}  // namespace quarzel::sweep
