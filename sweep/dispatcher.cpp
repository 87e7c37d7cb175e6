// SPDX-License-Identifier: MIT
#include "sweep/dispatcher.hpp"

#include <algorithm>
#include <utility>

namespace quarzel::sweep {

namespace {

/// Information bits of a task: enough to fill the lanes of the decoder many times over, but few enough to
/// stay in the second-level cache and to waste little where a point ends.
constexpr std::uint64_t bitsPerTask = 32768;

}  // namespace

std::vector<std::uint64_t> octetNumbers(const Task& task, const Shard& shard) {
    std::vector<std::uint64_t> numbers(task.octets);
    for (std::uint64_t i = 0; i < task.octets; ++i) {
        numbers[i] = (task.firstOctet + i) * shard.count + shard.index;
    }
    return numbers;
}

Dispatcher::Dispatcher(Plan plan) : itsPlan(std::move(plan)) {
    itsPoints.reserve(itsPlan.points.size());
    for (const PlannedPoint& point : itsPlan.points) {
        PointProgress progress(point.rule, itsPlan.shard, point.start, itsPlan.keptFailures);
        const std::uint64_t nextOctet = progress.octetsDone();
        itsPoints.push_back({std::move(progress), nextOctet, std::nullopt});
    }
    for (std::size_t i = 0; i < itsPoints.size(); ++i) {
        endCurveBelowTarget(i);
    }
}

/// Leave out what comes after a point with a block error rate below the target. It may have begun already.
void Dispatcher::endCurveBelowTarget(std::size_t point) {
    const PointState& state = itsPoints[point].progress.state();
    if (itsPoints[point].isLeftOut || !state.stoppedBy ||
        static_cast<double>(state.last().blockErrors) >=
            itsPlan.targetBler * static_cast<double>(state.blocks)) {
        return;
    }
    const std::vector<PlannedPoint>& planned = itsPlan.points;
    for (std::size_t i = point + 1; i < planned.size() && isSameCurve(planned[i].setup, planned[point].setup);
         ++i) {
        itsPoints[i].isLeftOut = true;
    }
}

std::uint64_t Dispatcher::usualOctets(std::size_t point) const {
    const std::uint64_t bits = itsPlan.points[point].setup.informationBits();
    return std::max<std::uint64_t>(bitsPerTask / (bits * blocksPerOctet), 1);
}

std::optional<Task> Dispatcher::next(unsigned size) {
    const std::lock_guard lock(itsMutex);
    if (itsStopped) {
        return std::nullopt;
    }
    for (; itsFirstWithWork < itsPoints.size(); ++itsFirstWithWork) {
        Point& point = itsPoints[itsFirstWithWork];
        if (point.isOver() || point.nextOctet == point.progress.octets()) {
            continue;
        }
        if (!point.since) {
            point.since = Clock::now();
        }
        const std::uint64_t octets =
            std::min(usualOctets(itsFirstWithWork) * size, point.progress.octets() - point.nextOctet);
        const Task task{itsFirstWithWork, point.nextOctet, octets};
        point.nextOctet += octets;
        return task;
    }
    return std::nullopt;
}

void Dispatcher::complete(const Task& task, ErrorList errors) {
    const std::lock_guard lock(itsMutex);
    Point& point = itsPoints[task.point];
    if (point.isOver()) {
        return;  // it ended before these blocks
    }
    point.progress.complete(task.firstOctet, task.octets, std::move(errors));
    const std::uint64_t limit = itsPlan.points[task.point].rule.maxSeconds;
    const double seconds = secondsOf(point);
    if (limit != 0 && seconds >= static_cast<double>(limit) && !point.progress.hasStopped()) {
        point.progress.stop(StopReason::time);
    }
    if (point.progress.hasStopped()) {
        point.progress.setSeconds(seconds);
        point.since.reset();
        endCurveBelowTarget(task.point);
    }
}

double Dispatcher::secondsOf(const Point& point) const {
    const double before = point.progress.state().seconds;
    return point.since ? before + std::chrono::duration<double>(Clock::now() - *point.since).count() : before;
}

void Dispatcher::stop() {
    const std::lock_guard lock(itsMutex);
    itsStopped = true;
}

void Dispatcher::fail(std::exception_ptr exception) {
    const std::lock_guard lock(itsMutex);
    itsStopped = true;
    itsException = std::move(exception);
}

void Dispatcher::rethrow() const {
    const std::lock_guard lock(itsMutex);
    if (itsException != nullptr) {
        std::rethrow_exception(itsException);
    }
}

bool Dispatcher::hasFinished() const {
    return firstUnfinished() == itsPoints.size();
}

std::size_t Dispatcher::firstUnfinished() const {
    const std::lock_guard lock(itsMutex);
    const auto found =
        std::find_if(itsPoints.begin(), itsPoints.end(), [](const Point& point) { return !point.isOver(); });
    return static_cast<std::size_t>(found - itsPoints.begin());
}

PointState Dispatcher::stateOf(const Point& point) const {
    PointState state = point.progress.state();
    state.seconds = secondsOf(point);
    return state;
}

Points Dispatcher::points() const {
    const std::lock_guard lock(itsMutex);
    Points points;
    for (std::size_t i = 0; i < itsPoints.size(); ++i) {
        const PointState& state = itsPoints[i].progress.state();
        if (!itsPoints[i].isLeftOut && (state.blocks != 0 || state.stoppedBy)) {
            points.emplace(itsPlan.points[i].setup, stateOf(itsPoints[i]));
        }
    }
    return points;
}

bool Dispatcher::isLeftOut(std::size_t point) const {
    const std::lock_guard lock(itsMutex);
    return itsPoints.at(point).isLeftOut;
}

PointState Dispatcher::stateOf(std::size_t point) const {
    const std::lock_guard lock(itsMutex);
    return stateOf(itsPoints.at(point));
}

std::vector<FailingBlock> Dispatcher::failuresOf(std::size_t point) const {
    const std::lock_guard lock(itsMutex);
    return itsPoints.at(point).progress.failures();
}

}  // namespace quarzel::sweep
