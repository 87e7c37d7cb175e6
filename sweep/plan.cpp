// SPDX-License-Identifier: MIT
#include "sweep/plan.hpp"

#include "sweep/error.hpp"

namespace quarzel::sweep {

Plan planOf(const Configuration& configuration, const Shard& shard, const Points& known) {
    configuration.check();
    Plan plan{configuration.seed,
              {},
              configuration.targetBler,
              dividesBlocks(configuration.stopRule) ? shard : Shard{},
              0};
    for (const Setup& setup : setupsOf(configuration, shard)) {
        PointState start = configuration.startOf(setup);
        if (const auto point = known.find(setup); point != known.end()) {
            if (point->second.counts.size() < start.counts.size()) {
                throw Error("has no counts after every iteration at " + setupText(setup),
                            "leave out --per-iteration or give another name");
            }
            start = point->second;
        }
        plan.points.push_back({setup, configuration.stopRule, std::move(start)});
    }
    return plan;
}

Plan repetitionOf(std::uint64_t seed, const Points& points) {
    Plan plan{seed, {}, 0, {}, 0};
    for (const auto& [setup, point] : points) {
        const bool endsByErrors = point.stoppedBy == StopReason::blockErrors;
        plan.points.push_back(
            {setup, {point.blocks, endsByErrors ? point.last().blockErrors : 0, 0}, point.emptied()});
    }
    return plan;
}

}  // namespace quarzel::sweep
