// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <mutex>
#include <optional>
#include <vector>

#include "sweep/plan.hpp"
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

/// Hands out the tasks of a sweep and collects the blocks in error. Tasks are handed out in the order of
/// points and blocks, and may be completed in any order.
///
/// Thread rule: all functions may be called from several threads at once.
class Dispatcher {
  public:
    using Clock = std::chrono::steady_clock;

    explicit Dispatcher(Plan plan);
    Dispatcher(const Dispatcher&) = delete;
    Dispatcher& operator=(const Dispatcher&) = delete;

    const Plan& plan() const { return itsPlan; }

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

    /// Whether every point has ended or is left out.
    bool hasFinished() const;

    /// The points that have begun and are not left out.
    Points points() const;

    /// Whether a point is left out, since its curve has ended before it.
    bool isLeftOut(std::size_t point) const;

    /// The state of one point.
    PointState stateOf(std::size_t point) const;

    /// The first failing blocks of one point among those that were simulated here, as many as the plan keeps.
    std::vector<FailingBlock> failuresOf(std::size_t point) const;

    /// The first point that has not ended and is not left out; the number of points when there is none.
    std::size_t firstUnfinished() const;

  private:
    struct Point {
        PointProgress progress;
        std::uint64_t nextOctet;
        std::optional<Clock::time_point> since;  ///< when this run began it
        bool isLeftOut = false;

        bool isOver() const { return isLeftOut || progress.hasStopped(); }
    };

    std::uint64_t usualOctets(std::size_t point) const;
    void endCurveBelowTarget(std::size_t point);
    double secondsOf(const Point& point) const;
    PointState stateOf(const Point& point) const;

    const Plan itsPlan;
    mutable std::mutex itsMutex;  ///< guards what follows
    std::vector<Point> itsPoints;
    std::size_t itsFirstWithWork = 0;
    bool itsStopped = false;
    std::exception_ptr itsException;
};

}  // namespace quarzel::sweep
