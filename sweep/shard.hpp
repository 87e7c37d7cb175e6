// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

#include "sweep/configuration.hpp"

namespace quarzel::sweep {

/// A part of a sweep, for one run of several.
struct Shard {
    std::uint64_t index = 0;
    std::uint64_t count = 1;

    static constexpr std::uint64_t highestCount = 1'000'000;

    bool isWhole() const { return count == 1; }
    bool operator==(const Shard&) const = default;
};

/// Whether a sweep divides the blocks of its points among its shards: the octets of blocks whose number
/// leaves the remainder `index` modulo `count`. It does where points do not end by errors, since a shard
/// cannot know of those in the others. Else whole points are dealt out.
bool dividesBlocks(const StopRule& rule);

/// The points of a shard, in their order: all when blocks are divided. Else they are dealt out, the one that
/// probably takes longest first, each to the shard that has least to do.
std::vector<Setup> setupsOf(const Configuration& configuration, const Shard& shard);

}  // namespace quarzel::sweep
