// SPDX-License-Identifier: MIT
#include "sweeps/sweep_progress.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <utility>
#include <vector>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

/// The blocks that each point will probably have at its end.
std::vector<double> expectedBlocks(const std::vector<sweep::PointState>& points, const sweep::Plan& plan) {
    std::vector<double> expected;
    std::size_t curveBefore = 0;  // where it begins
    std::size_t curve = 0;
    for (std::size_t i = 0; i < points.size(); ++i) {
        if (i > 0 && !sweep::isSameCurve(plan.points[i].setup, plan.points[i - 1].setup)) {
            curveBefore = std::exchange(curve, i);
        }
        const std::size_t onCurve = i - curve;
        const sweep::StopRule& rule = plan.points[i].rule;
        const double most = static_cast<double>(rule.maxBlocks) / static_cast<double>(plan.shard.count);
        const auto wanted = static_cast<double>(rule.maxBlockErrors);
        const auto blocks = static_cast<double>(points[i].blocks);
        const auto errors = static_cast<double>(points[i].last().blockErrors);
        double foretold = most;
        if (points[i].stoppedBy) {
            expected.push_back(blocks);
            continue;
        }
        if (wanted != 0 && errors != 0) {
            foretold = blocks * wanted / errors;
        } else if (wanted != 0 && blocks == 0 && onCurve > 0) {
            const double growth = onCurve > 1 ? expected[i - 1] / expected[i - 2] : 1;
            foretold = expected[i - 1] * std::max(growth, 1.0);
        } else if (wanted != 0 && blocks == 0 && curve > 0) {
            foretold = expected[curveBefore];
        }
        expected.push_back(std::clamp(foretold, std::min(std::max(blocks, 1.0), most), most));
    }
    return expected;
}

}  // namespace

std::string SweepProgress::text() const {
    return fmt::format("{} of {} points, {} blocks, {} block errors{}", pointsDone, points, blocks,
                       blockErrors, secondsLeft ? fmt::format(", {} left", durationText(*secondsLeft)) : "");
}

SweepProgress ProgressMeter::measure(const sweep::Dispatcher& dispatcher, Clock::time_point now) {
    const std::vector<sweep::PlannedPoint>& planned = dispatcher.plan().points;
    SweepProgress progress;
    progress.points = planned.size();
    std::vector<sweep::PointState> points;
    double bits = 0;
    double cost = 0;
    for (std::size_t i = 0; i < progress.points; ++i) {
        sweep::PointState& point = points.emplace_back(dispatcher.stateOf(i));
        if (dispatcher.isLeftOut(i)) {
            point.stoppedBy = sweep::StopReason::blocks;  // nothing of it is left to be done
        }
        const sweep::Setup& setup = planned[i].setup;
        progress.pointsDone += point.stoppedBy ? 1 : 0;
        progress.blocks += point.blocks;
        progress.blockErrors += point.last().blockErrors;
        bits += static_cast<double>(point.blocks) * setup.informationBits();
        cost += static_cast<double>(point.blocks) * setup.informationBits() * setup.iterations;
    }
    if (!itsBeginning) {
        itsBeginning = {now, bits, cost};
    }
    const std::chrono::duration<double> elapsed = now - itsBeginning->time;
    if (elapsed.count() <= 0 || cost <= itsBeginning->cost) {
        return progress;
    }
    progress.bitsPerSecond = (bits - itsBeginning->bits) / elapsed.count();
    const double costPerSecond = (cost - itsBeginning->cost) / elapsed.count();
    const std::vector<double> expected = expectedBlocks(points, dispatcher.plan());
    progress.secondsLeft = 0;
    for (std::size_t i = 0; i < points.size(); ++i) {
        const sweep::Setup& setup = planned[i].setup;
        const double seconds = (expected[i] - static_cast<double>(points[i].blocks)) *
                               setup.informationBits() * setup.iterations / costPerSecond;
        const auto limit = static_cast<double>(planned[i].rule.maxSeconds);
        *progress.secondsLeft +=
            limit == 0 ? seconds : std::min(seconds, std::max(limit - points[i].seconds, 0.0));
    }
    return progress;
}

}  // namespace quarzel::tool
