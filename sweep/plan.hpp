// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

#include "sweep/points.hpp"
#include "sweep/shard.hpp"

namespace quarzel::sweep {

/// A point that is to be simulated, and where it goes on.
struct PlannedPoint {
    Setup setup;
    StopRule rule;
    PointState start;
};

/// A sweep that is to be run.
struct Plan {
    std::uint64_t seed = 1;
    std::vector<PlannedPoint> points;
    double targetBler = 0;  ///< as in Configuration
    Shard shard = {};       ///< whose blocks are simulated; whole unless the blocks of points are divided
    std::uint64_t keptFailures = 0;  ///< how many failing blocks of each point are remembered, the first ones
};

/// The plan of a sweep or a shard of it.
/// @param known  points that go on where they are
/// @throws Error when the configuration is not possible, or a known point lacks counts that it asks for
Plan planOf(const Configuration& configuration, const Shard& shard = {}, const Points& known = {});

/// The plan that simulates points again, from their first block to their last.
Plan repetitionOf(std::uint64_t seed, const Points& points);

}  // namespace quarzel::sweep
