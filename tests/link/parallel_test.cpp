// SPDX-License-Identifier: MIT
#include "link/parallel.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <latch>
#include <set>
#include <stdexcept>
#include <string>

namespace {

using quarzel::link::forEachOnThreads;

TEST(ForEachOnThreads, DoesEveryPieceOnce) {
    for (const unsigned threads : {1U, 2U, 7U}) {
        std::vector<std::atomic<int>> times(1000);
        forEachOnThreads(times.size(), threads, [&] { return [&](std::size_t piece) { ++times[piece]; }; });
        EXPECT_THAT(std::vector<int>(times.begin(), times.end()), testing::Each(1)) << threads << " threads";
    }
}

TEST(ForEachOnThreads, DoesNothingForNoPiece) {
    forEachOnThreads(0, 3, [] { return [](std::size_t) { FAIL(); }; });
}

// Every piece waits for all others, so that each needs a thread.
TEST(ForEachOnThreads, GivesEveryThreadAWorkerOfItsOwn) {
    constexpr unsigned threads = 4;
    std::latch allAreAtWork(threads);
    std::mutex mutex;
    std::set<std::thread::id> makers;
    std::set<std::thread::id> workers;
    forEachOnThreads(threads, threads, [&] {
        const std::lock_guard lock(mutex);
        EXPECT_TRUE(makers.insert(std::this_thread::get_id()).second);
        return [&, maker = std::this_thread::get_id()](std::size_t) {
            allAreAtWork.arrive_and_wait();
            const std::lock_guard workLock(mutex);
            EXPECT_EQ(maker, std::this_thread::get_id());
            workers.insert(maker);
        };
    });
    EXPECT_EQ(workers.size(), threads);
    EXPECT_EQ(makers, workers);
    EXPECT_TRUE(workers.contains(std::this_thread::get_id()));
}

// All pieces throw, once all have been taken and in an order that the threads decide.
TEST(ForEachOnThreads, ThrowsWhatTheFirstPieceThrew) {
    constexpr unsigned threads = 4;
    for (int round = 0; round < 100; ++round) {
        std::latch allAreAtWork(threads);
        try {
            forEachOnThreads(threads, threads, [&] {
                return [&](std::size_t piece) {
                    allAreAtWork.arrive_and_wait();
                    throw std::runtime_error(std::to_string(piece));
                };
            });
            FAIL() << "nothing was thrown";
        } catch (const std::runtime_error& error) {
            EXPECT_STREQ(error.what(), "0");
        }
    }
}

TEST(ForEachOnThreads, TakesNoPieceAfterOneThatThrew) {
    std::size_t done = 0;
    EXPECT_THROW(forEachOnThreads(1000, 1,
                                  [&] {
                                      return [&](std::size_t piece) {
                                          ++done;
                                          if (piece == 5) {
                                              throw std::runtime_error("enough");
                                          }
                                      };
                                  }),
                 std::runtime_error);
    EXPECT_EQ(done, 6U);
}

TEST(ForEachOnThreads, ThrowsWhatMakingAWorkerThrew) {
    const auto makeNone = []() -> void (*)(std::size_t) { throw std::runtime_error("no worker"); };
    EXPECT_THROW(forEachOnThreads(3, 2, makeNone), std::runtime_error);
}

}  // namespace
