// SPDX-License-Identifier: MIT
#include "sweep/threshold.hpp"

#include <algorithm>
#include <cmath>

#include "sweep/natural_log.hpp"
#include "sweep/predicted_cost.hpp"
#include "sweep/statistics.hpp"

namespace quarzel::sweep {

namespace {

constexpr double microPerDecibel = 1e6;
constexpr double lowestEbN0 = -20;
constexpr double highestEbN0 = 40;
/// Errors that are expected where a point has the rate that is looked for, to tell on which side of it it
/// lies.
constexpr double fewErrors = 20;
/// Errors that each neighbour has at least, so that the slope between them is known well.
constexpr double manyErrors = 100;
constexpr double mostGrowth = 8;  // of a point's blocks at once
constexpr double margin = 1.1;    // of blocks, so that the next look is likely to be the last one
constexpr std::int64_t firstStride = 4;

struct Sample {
    double blocks;
    double errors;

    double rate() const { return errors / blocks; }
    double logOfRate() const { return naturalLog(rate()); }
    /// Of the logarithm of the rate.
    double variance() const { return (1 - rate()) / errors; }
};

/// The Eb/N0 that a curve is looked at: whole multiples of a step in which the rate falls to about a third.
class Grid {
  public:
    explicit Grid(const Target& target) : itsTarget(target) {
        Setup usual = target.curve;
        usual.iterations = target.iterations;
        const Waterfall waterfall = usualWaterfall(usual);
        itsStep = waterfall.perDecade > 0.6 ? 200'000 : waterfall.perDecade > 0.15 ? 100'000 : 50'000;
        const double guess =
            waterfall.start - waterfall.perDecade * naturalLog(10 * target.rate) / naturalLog(10);
        itsFirst = std::lround(guess / step());
    }

    double step() const { return static_cast<double>(itsStep) / microPerDecibel; }
    std::int64_t first() const { return itsFirst; }
    double at(std::int64_t i) const { return static_cast<double>(i) * step(); }

    Setup setupAt(std::int64_t i) const {
        Setup setup = itsTarget.curve;
        setup.ebN0 = {static_cast<std::int32_t>(i * itsStep)};
        return setup;
    }

    Sample sampleAt(std::int64_t i, const Points& points) const {
        const auto found = points.find(setupAt(i));
        if (found == points.end()) {
            return {0, 0};
        }
        const PointState& point = found->second;
        const ErrorCount& count = itsTarget.iterations == itsTarget.curve.iterations
                                      ? point.last()
                                      : point.counts.at(static_cast<std::size_t>(itsTarget.iterations) - 1);
        return {static_cast<double>(point.blocks), static_cast<double>(count.blockErrors)};
    }

  private:
    const Target& itsTarget;
    std::int64_t itsStep = 0;  // in millionths of a dB
    std::int64_t itsFirst = 0;
};

/// The threshold between two neighbours, once they are known well enough.
SearchState between(std::int64_t low, const Target& target, const Grid& grid, const Points& points) {
    const Sample a = grid.sampleAt(low, points);
    const Sample b = grid.sampleAt(low + 1, points);
    const double fewest = std::max(std::min(a.errors, b.errors), 1.0);
    double growth = manyErrors / fewest;
    if (b.errors > 0) {
        const double fall = a.logOfRate() - b.logOfRate();
        const double part = (a.logOfRate() - naturalLog(target.rate)) / fall;
        const double deviation =
            std::sqrt((1 - part) * (1 - part) * a.variance() + part * part * b.variance()) * grid.step() /
            fall;
        const double width = deviations * deviation;
        growth = std::max(growth, width * width / (target.precision * target.precision));
        if (growth <= 1) {
            const double ebN0 = grid.at(low) + part * grid.step();
            return {{}, Threshold{ebN0, ebN0 - width, ebN0 + width}};
        }
    }
    growth = std::min(growth * margin, mostGrowth);
    SearchState state;
    for (const auto& [i, sample] : {std::pair{low, a}, std::pair{low + 1, b}}) {
        state.needs.push_back({grid.setupAt(i), static_cast<std::uint64_t>(sample.blocks * growth) + 1});
    }
    return state;
}

}  // namespace

SearchState stateOf(const Target& target, const Points& points) {
    const Grid grid(target);
    const double fewBlocks = std::ceil(fewErrors / target.rate);
    std::optional<std::int64_t> low;
    std::optional<std::int64_t> high;
    std::int64_t stride = firstStride;
    for (std::int64_t i = grid.first(); grid.at(i) >= lowestEbN0 && grid.at(i) <= highestEbN0;) {
        const Sample sample = grid.sampleAt(i, points);
        if (sample.blocks < fewBlocks) {
            return {{{grid.setupAt(i), static_cast<std::uint64_t>(fewBlocks)}}, std::nullopt};
        }
        (sample.rate() >= target.rate ? low : high) = i;
        if (low && high) {
            if (*high - *low == 1) {
                return between(*low, target, grid, points);
            }
            i = *low + (*high - *low) / 2;
        } else {
            i += low ? stride : -stride;
            stride *= 2;
        }
    }
    return {};
}

}  // namespace quarzel::sweep
