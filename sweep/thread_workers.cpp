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
        const Configuration& configuration = dispatcher.configuration();
        BlockSimulator simulator(configuration, channels);
        while (const auto task = dispatcher.next()) {
            dispatcher.complete(
                *task, simulator.simulate(dispatcher.curves()[task->point / configuration.ebN0.size()],
                                          configuration.ebN0[task->point % configuration.ebN0.size()],
                                          octetNumbers(*task, dispatcher.shard())));
        }
    } catch (...) {
        dispatcher.fail(std::current_exception());
    }
}

}  // namespace

void ThreadWorkers::run(Dispatcher& dispatcher, Observer& observer) {
    Channels channels(dispatcher.configuration().quantiser);
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
