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

/// Some blocks of a point, for one worker.
struct Task {
    std::uint64_t point;
    std::uint64_t firstGroup;  ///< of the shard's groups
    std::uint64_t groups;
};

/// The numbers of the groups of a task among all of the point.
std::vector<std::uint64_t> groupNumbers(const Task& task, const Shard& shard);

/// What there is to do.
struct Plan {
    Configuration configuration;
    Shard shard = {};
    std::vector<PointState> start = {};        ///< where each point goes on; empty: all at the beginning
    std::vector<std::uint64_t> timedOut = {};  ///< if a finished sweep is run again: for each point the block
                                               ///< at which time ended it, or 0
};

/// Hands out the work of a sweep and takes in what comes of it. Tasks are handed out in the order of points
/// and blocks, and may come back in any.
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
    /// @param size  how many times the usual number of blocks
    /// @return      none when all are handed out or `stop` was called
    std::optional<Task> next(unsigned size = 1);

    /// Take in what came of a task.
    void complete(const Task& task, ErrorList errors);

    /// Hand out no more tasks.
    void stop();

    /// Hand out no more tasks, because one failed with this exception.
    void fail(std::exception_ptr exception);

    /// Throw what a task has failed with, if one has.
    void rethrow() const;

    /// Whether every point has ended.
    bool hasFinished() const;

    /// How far every point is.
    std::vector<PointState> states() const;

    /// How far one point is, without its list of errors.
    PointState stateOf(std::size_t point) const;

    /// The first point that has not ended, or their number.
    std::size_t firstUnfinished() const;

  private:
    struct Point {
        PointProgress progress;
        std::uint64_t nextGroup;
        std::optional<Clock::time_point> since;  ///< when it was begun in this run
    };

    std::uint64_t usualGroups(std::size_t point) const;
    double secondsOf(const Point& point) const;

    const Plan itsPlan;
    const std::vector<Curve> itsCurves;
    mutable std::mutex itsMutex;  ///< of what follows
    std::vector<Point> itsPoints;
    std::size_t itsFirstWithWork = 0;
    bool itsStopped = false;
    std::exception_ptr itsException;
};

}  // namespace quarzel::sweep
