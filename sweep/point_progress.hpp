// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <map>
#include <vector>

#include "sweep/point_state.hpp"
#include "sweep/shard.hpp"

namespace quarzel::sweep {

/// A block that was decoded wrongly or, if it has CRCs, rejected.
struct FailingBlock {
    std::uint64_t number;     ///< at its point, from 0
    std::uint32_t bitErrors;  ///< at the last count

    bool operator==(const FailingBlock&) const = default;
};

/// Puts the blocks of a point in order as they come in, and finds where the point ends. The stop rule looks
/// at blocks in order, so a point ends at the same block whoever simulates it and whenever.
class PointProgress {
  public:
    /// @param shard         whole, unless the rule knows no limit of errors
    /// @param state         where to go on; a point that has ended goes on if the rule says so
    /// @param keptFailures  how many failing blocks are remembered
    PointProgress(const StopRule& rule, const Shard& shard, PointState state, std::uint64_t keptFailures = 0);

    /// Octets in the shard.
    std::uint64_t octets() const { return itsOctets; }

    /// The first octet of the shard that is not done to its end.
    std::uint64_t octetsDone() const { return itsOctetsDone; }

    /// Take in the blocks in error of some octets, which may be ahead of the next ones.
    void complete(std::uint64_t firstOctet, std::uint64_t octets, ErrorList errors);

    /// End the point where it is.
    void stop(StopReason reason) { itsState.stoppedBy = reason; }
    bool hasStopped() const { return itsState.stoppedBy.has_value(); }

    const PointState& state() const { return itsState; }

    /// The first failing blocks since the state that it began with, in ascending order.
    const std::vector<FailingBlock>& failures() const { return itsFailures; }

    void setSeconds(double seconds) { itsState.seconds = seconds; }

  private:
    struct Piece {
        std::uint64_t octets;
        ErrorList errors;
    };

    void add(const Piece& piece);
    std::uint64_t blocksIn(std::uint64_t octets) const;

    StopRule itsRule;
    Shard itsShard;
    std::uint64_t itsOctets;
    std::uint64_t itsOctetsDone;
    std::uint64_t itsFirstBlock;  ///< those before it are counted already
    PointState itsState;
    std::uint64_t itsKeptFailures;
    std::vector<FailingBlock> itsFailures;
    std::map<std::uint64_t, Piece> itsWaiting;  ///< by first octet: ahead of the next ones
};

}  // namespace quarzel::sweep
