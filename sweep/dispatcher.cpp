// SPDX-License-Identifier: MIT
#include "sweep/dispatcher.hpp"

#include <algorithm>
#include <utility>

#include "sweep/part.hpp"

namespace quarzel::sweep {

namespace {

/// Information bits of a task: enough to fill the lanes of the decoder many times over, but few enough to
/// stay in the second-level cache and to waste little where a point ends.
constexpr std::uint64_t bitsPerTask = 32768;

const Configuration& checked(const Configuration& configuration) {
    configuration.check();
    return configuration;
}

}  // namespace

std::vector<std::uint64_t> octetNumbers(const Task& task, const Shard& shard) {
    std::vector<std::uint64_t> numbers(task.octets);
    for (std::uint64_t i = 0; i < task.octets; ++i) {
        numbers[i] = (task.firstOctet + i) * shard.count + shard.index;
    }
    return numbers;
}

Dispatcher::Dispatcher(Plan plan) : itsPlan(std::move(plan)), itsCurves(checked(configuration()).curves()) {
    const std::vector<PointState> start =
        itsPlan.start.empty() ? freshPart(configuration(), shard()).points : itsPlan.start;
    itsPoints.reserve(start.size());
    for (std::size_t p = 0; p < start.size(); ++p) {
        const std::uint64_t end = itsPlan.timedOut.empty() ? 0 : itsPlan.timedOut[p];
        PointProgress progress(configuration(), shard(), end != 0 ? end : configuration().maxBlocks,
                               start[p]);
        const std::uint64_t nextOctet = progress.octetsDone();
        itsPoints.push_back({std::move(progress), nextOctet, std::nullopt});
    }
}

std::uint64_t Dispatcher::usualOctets(std::size_t point) const {
    const std::uint64_t K = itsCurves[point / configuration().ebN0.size()].blockSize;
    return std::max<std::uint64_t>(bitsPerTask / (K * blocksPerOctet), 1);
}

std::optional<Task> Dispatcher::next(unsigned size) {
    const std::lock_guard lock(itsMutex);
    if (itsStopped) {
        return std::nullopt;
    }
    for (; itsFirstWithWork < itsPoints.size(); ++itsFirstWithWork) {
        Point& point = itsPoints[itsFirstWithWork];
        if (point.progress.hasStopped() || point.nextOctet == point.progress.octets()) {
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
    if (point.progress.hasStopped()) {
        return;  // it ended before these blocks
    }
    point.progress.complete(task.firstOctet, task.octets, std::move(errors));
    const bool isRepetition = !itsPlan.timedOut.empty();
    if (isRepetition && itsPlan.timedOut[task.point] != 0 &&
        point.progress.state().stoppedBy == StopReason::blocks) {
        point.progress.stop(StopReason::time);
    }
    const std::uint64_t limit = isRepetition ? 0 : configuration().maxSeconds;
    const double seconds = secondsOf(point);
    if (limit != 0 && seconds >= static_cast<double>(limit) && !point.progress.hasStopped()) {
        point.progress.stop(StopReason::time);
    }
    if (point.progress.hasStopped()) {
        point.progress.setSeconds(seconds);
        point.since.reset();
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
    return firstUnfinished() == configuration().points();
}

std::size_t Dispatcher::firstUnfinished() const {
    const std::lock_guard lock(itsMutex);
    const auto found = std::find_if(itsPoints.begin(), itsPoints.end(),
                                    [](const Point& point) { return !point.progress.hasStopped(); });
    return static_cast<std::size_t>(found - itsPoints.begin());
}

std::vector<PointState> Dispatcher::states() const {
    const std::lock_guard lock(itsMutex);
    std::vector<PointState> states;
    for (const Point& point : itsPoints) {
        states.push_back(point.progress.state());
        states.back().seconds = secondsOf(point);
    }
    return states;
}

PointState Dispatcher::stateOf(std::size_t index) const {
    const std::lock_guard lock(itsMutex);
    const Point& point = itsPoints.at(index);
    PointState state = point.progress.summary();
    state.seconds = secondsOf(point);
    return state;
}

}  // namespace quarzel::sweep
