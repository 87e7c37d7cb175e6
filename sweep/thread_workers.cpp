// SPDX-License-Identifier: MIT
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <system_error>
#include <thread>
#include <vector>

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
                                          groupNumbers(*task, dispatcher.shard())));
        }
    } catch (...) {
        dispatcher.fail(std::current_exception());
    }
}

/// How many threads are still at work.
class Count {
  public:
    void add() {
        const std::lock_guard lock(itsMutex);
        ++itsNumber;
    }
    void subtract() {
        const std::lock_guard lock(itsMutex);
        --itsNumber;
        itsChanged.notify_all();
    }
    /// Wait for a while. @return whether none is left
    bool isNoneAfter(std::chrono::milliseconds time) {
        std::unique_lock lock(itsMutex);
        return itsChanged.wait_for(lock, time, [this] { return itsNumber == 0; });
    }

  private:
    std::mutex itsMutex;
    std::condition_variable itsChanged;
    unsigned itsNumber = 0;
};

}  // namespace

void ThreadWorkers::run(Dispatcher& dispatcher, Observer& observer) {
    Channels channels(dispatcher.configuration().quantiser);
    Count atWork;
    std::vector<std::jthread> threads;
    try {
        for (unsigned i = 0; i < itsThreads; ++i) {
            atWork.add();
            threads.emplace_back([&] {
                work(dispatcher, channels);
                atWork.subtract();
            });
        }
    } catch (const std::system_error&) {
        // The system gives no more threads. Those that there are do the work.
        atWork.subtract();
        if (threads.empty()) {
            throw;
        }
    }
    try {
        while (!atWork.isNoneAfter(tickPeriod)) {
            observer.tick(dispatcher);
        }
        threads.clear();
        observer.tick(dispatcher);
    } catch (...) {
        dispatcher.stop();
        throw;
    }
    dispatcher.rethrow();
}

}  // namespace quarzel::sweep
