// SPDX-License-Identifier: MIT
#include <chrono>
#include <cstddef>
#include <exception>
#include <future>

#include "link/parallel.hpp"
#include "sweep/block_simulator.hpp"
#include "sweep/run.hpp"

namespace quarzel::sweep {

namespace {

constexpr std::chrono::milliseconds tickPeriod{50};

/// Do tasks until there are none.
void work(Dispatcher& dispatcher, Channels& channels) {
    try {
        const Plan& plan = dispatcher.plan();
        BlockSimulator simulator(plan.seed, channels);
        while (const auto task = dispatcher.next()) {
            const PlannedPoint& point = plan.points[task->point];
            dispatcher.complete(*task, simulator.simulate(point.setup, point.start.counts.size(),
                                                          octetNumbers(*task, plan.shard)));
        }
    } catch (...) {
        dispatcher.fail(std::current_exception());
    }
}

}  // namespace

void ThreadWorkers::run(Dispatcher& dispatcher, Observer& observer) {
    Channels channels;
    const auto workers = std::async(std::launch::async, [&] {
        link::forEachOnThreads(itsThreads, itsThreads,
                               [&] { return [&](std::size_t) { work(dispatcher, channels); }; });
    });
    try {
        while (workers.wait_for(tickPeriod) != std::future_status::ready) {
            observer.tick(dispatcher);
        }
        observer.tick(dispatcher);
    } catch (...) {
        dispatcher.stop();
        throw;
    }
    dispatcher.rethrow();
}

}  // namespace quarzel::sweep
