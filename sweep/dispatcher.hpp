// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <mutex>
#include <optional>
#include <vector>

#include "sweep/point_progress.hpp"

namespace quarzel::sweep {

/// Some octets of blocks of a point, for one worker.
struct Task {
    std::uint64_t point;
    std::uint64_t firstOctet;  ///< counted among those of the shard
    std::uint64_t octets;
};

/// The octets of a task, by their numbers in the point.
std::vector<std::uint64_t> octetNumbers(const Task& task, const Shard& shard);

/// A sweep that is to be run.
struct Plan {
    Configuration configuration;
    Shard shard = {};
    std::vector<PointState> start = {};        ///< where each point goes on; empty: all from the beginning
    std::vector<std::uint64_t> timedOut = {};  ///< to run a finished sweep again: for each point the blocks
                                               ///< after which time ended it, or 0
};

/// Hands out the tasks of a sweep and collects the blocks in error. Tasks are handed out in the order of
/// points and blocks, and may be completed in any order.
///
/// Thread rule: all functions may be called from several threads at once.
class Dispatcher {
  public:
    using Clock = std::chrono::steady_clock;

    /// @throws Error when the configuration is not possible
    explicit Dispatcher(Plan plan);
    Dispatcher(const Dispatcher&) = delete;
    Dispatcher& operator=(const Dispatcher&) = delete;

    const Configuration& configuration() const { return itsPlan.configuration; }
    const Shard& shard() const { return itsPlan.shard; }
    const std::vector<Curve>& curves() const { return itsCurves; }

    /// The next task.
    /// @param size  of the task, as a multiple of the usual one
    /// @return      none when all are handed out or `stop` was called
    std::optional<Task> next(unsigned size = 1);

    /// Take in the blocks in error of a task.
    void complete(const Task& task, ErrorList errors);

    /// Hand out no more tasks.
    void stop();

    /// Hand out no more tasks: one has failed with this exception.
    void fail(std::exception_ptr exception);

    /// Throw the exception with which a task has failed, if one has.
    void rethrow() const;

    /// Whether every point has ended.
    bool hasFinished() const;

    /// The state of every point.
    std::vector<PointState> states() const;

    /// The state of one point, without its list of errors.
    PointState stateOf(std::size_t point) const;

    /// The first point that has not ended; the number of points when all have.
    std::size_t firstUnfinished() const;

  private:
    struct Point {
        PointProgress progress;
        std::uint64_t nextOctet;
        std::optional<Clock::time_point> since;  ///< when this run began it
    };

    std::uint64_t usualOctets(std::size_t point) const;
    double secondsOf(const Point& point) const;

    const Plan itsPlan;
    const std::vector<Curve> itsCurves;
    mutable std::mutex itsMutex;  ///< guards what follows
    std::vector<Point> itsPoints;
    std::size_t itsFirstWithWork = 0;
    bool itsStopped = false;
    std::exception_ptr itsException;
};

}  // namespace quarzel::sweep
