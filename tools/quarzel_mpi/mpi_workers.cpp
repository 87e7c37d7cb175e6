// SPDX-License-Identifier: MIT
#include "mpi_workers.hpp"

#define OMPI_SKIP_MPICXX 1
#define MPICH_SKIP_MPICXX 1
#include <mpi.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <exception>
#include <mutex>
#include <thread>

#include "link/parallel.hpp"
#include "mpi_messages.hpp"
#include "sweep/block_simulator.hpp"

namespace quarzel::mpi {

namespace {

/// How much larger the tasks of other ranks are, since asking for one takes time.
constexpr unsigned taskSize = 8;
constexpr std::chrono::microseconds nap{100};
constexpr std::chrono::milliseconds tickPeriod{50};

/// The sum of a number over all ranks.
unsigned sumOver(unsigned threads) {
    unsigned sum = 0;
    MPI_Allreduce(&threads, &sum, 1, MPI_UNSIGNED, MPI_SUM, MPI_COMM_WORLD);
    return sum;
}

/// Answer a request if one has come.
/// @return whether one had
bool answerRequest(sweep::Dispatcher& dispatcher, unsigned& askers) {
    std::optional<Request> request = pollRequest();
    if (!request) {
        return false;
    }
    if (request->outcome) {
        dispatcher.complete(request->outcome->task, std::move(request->outcome->errors));
    }
    const std::optional<sweep::Task> task = dispatcher.next(taskSize);
    answer(request->rank, task);
    askers -= task ? 0 : 1;
    return true;
}

/// What the threads of a rank do: they ask rank 0 for tasks, one at a time.
class Asker {
  public:
    explicit Asker(const sweep::Plan& plan) : itsPlan(plan) {}

    void run() {
        sweep::BlockSimulator simulator(itsPlan.seed, itsChannels);
        std::optional<Outcome> outcome;
        while (const std::optional<sweep::Task> task = ask(outcome)) {
            const sweep::PlannedPoint& point = itsPlan.points[task->point];
            outcome = Outcome{*task, simulator.simulate(point.setup, point.start.counts.size(),
                                                        sweep::octetNumbers(*task, itsPlan.shard))};
        }
    }

  private:
    std::optional<sweep::Task> ask(const std::optional<Outcome>& outcome) {
        const std::lock_guard lock(itsMutex);
        return exchange(outcome);
    }

    const sweep::Plan& itsPlan;
    sweep::Channels itsChannels;
    std::mutex itsMutex;
};

}  // namespace

void MpiWorkers::run(sweep::Dispatcher& dispatcher, sweep::Observer& observer) {
    announce(Announcement{dispatcher.plan(), itsThreads});
    unsigned askers = sumOver(0);  // threads of the other ranks
    std::atomic<bool> isDoneHere = false;
    std::exception_ptr failure;
    const std::jthread here([&] {
        try {
            sweep::Observer none;
            sweep::ThreadWorkers(itsThreads == 0 ? itsUsual : itsThreads).run(dispatcher, none);
        } catch (...) {
            dispatcher.fail(std::current_exception());
        }
        isDoneHere = true;
    });
    auto nextTick = sweep::Dispatcher::Clock::now() + tickPeriod;
    while (askers > 0 || !isDoneHere) {
        if (!answerRequest(dispatcher, askers)) {
            std::this_thread::sleep_for(nap);
        }
        if (failure == nullptr && sweep::Dispatcher::Clock::now() >= nextTick) {
            try {
                observer.tick(dispatcher);
            } catch (...) {
                failure = std::current_exception();
                dispatcher.stop();
            }
            nextTick = sweep::Dispatcher::Clock::now() + tickPeriod;
        }
    }
    if (failure != nullptr) {
        std::rethrow_exception(failure);
    }
    observer.tick(dispatcher);
    dispatcher.rethrow();
}

void serve(unsigned usual, unsigned max) {
    while (const std::optional<Announcement> announcement = awaitAnnouncement()) {
        const unsigned threads = std::min(announcement->threads == 0 ? usual : announcement->threads, max);
        sumOver(threads);
        Asker asker(announcement->plan);
        link::forEachOnThreads(threads, threads, [&asker] { return [&asker](std::size_t) { asker.run(); }; });
    }
}

}  // namespace quarzel::mpi
