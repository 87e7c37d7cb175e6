// SPDX-License-Identifier: MIT
#include "sweeps/failing_blocks.hpp"

#include <algorithm>

#include "sweeps/interruption.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// Ends the work when a signal comes.
class StopOnSignal : public sweep::Observer {
  public:
    void tick(sweep::Dispatcher& dispatcher) override {
        if (itsInterruption.hasCome()) {
            dispatcher.stop();
        }
    }

  private:
    Interruption itsInterruption;
};

}  // namespace

FailingBlocks failingBlocksOf(const sweep::Points& points, const sweep::Dispatcher& dispatcher,
                              sweep::Workers& workers) {
    const sweep::Plan& plan = dispatcher.plan();
    std::map<sweep::Setup, std::size_t> fresh;  // points that were simulated here from their first block on
    for (std::size_t i = 0; i < plan.points.size(); ++i) {
        if (plan.points[i].start.blocks == 0 && !dispatcher.isLeftOut(i)) {
            fresh.emplace(plan.points[i].setup, i);
        }
    }
    FailingBlocks failing;
    sweep::Plan search{plan.seed, {}, 0, plan.shard, plan.keptFailures};
    for (const auto& [setup, state] : points) {
        if (state.last().blockErrors == 0) {
            continue;
        }
        if (const auto here = fresh.find(setup); here != fresh.end()) {
            failing[setup] = dispatcher.failuresOf(here->second);
            continue;
        }
        // The blocks of a shard are those of its octets, up to where the whole point ends.
        const std::uint64_t end = plan.shard.isWhole() ? state.blocks : plan.points.front().rule.maxBlocks;
        search.points.push_back(
            {setup, {end, std::min(plan.keptFailures, state.last().blockErrors), 0}, state.emptied()});
    }
    if (search.points.empty()) {
        return failing;
    }
    sweep::Dispatcher searcher(search);
    StopOnSignal observer;
    workers.run(searcher, observer);
    if (!searcher.hasFinished()) {
        throw ToolError(ExitCode::interrupted, "--keep-failures", "not all failing blocks were found",
                        "run the command again; the result is there");
    }
    for (std::size_t i = 0; i < search.points.size(); ++i) {
        failing[search.points[i].setup] = searcher.failuresOf(i);
    }
    return failing;
}

}  // namespace quarzel::tool
