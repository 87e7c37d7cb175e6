// SPDX-License-Identifier: MIT
#include "plot/measured_points.hpp"

#include <cmath>

#include "sweep/statistics.hpp"

namespace quarzel::tool {

namespace {

using sweep::Interval;
using sweep::PointState;
using sweep::Rates;

/// The share of wrong bits in a wrong block, at the point with errors that is nearest to an Eb/N0; 1 when no
/// point has errors.
double wrongShareNear(const SweepCurve& curve, double ebN0) {
    const PointState* nearest = nullptr;
    double distance = 0;
    for (const MeasuredPoint& point : curve.points) {
        if (const double here = std::abs(point.ebN0 - ebN0);
            point.state.last().blockErrors > 0 && (nearest == nullptr || here < distance)) {
            nearest = &point.state;
            distance = here;
        }
    }
    return nearest == nullptr ? 1
                              : static_cast<double>(nearest->last().bitErrors) /
                                    static_cast<double>(nearest->last().blockErrors) / curve.blockSize;
}

}  // namespace

std::vector<DrawnPoint> measuredPoints(const SweepCurve& curve, const std::string& rate) {
    std::vector<DrawnPoint> drawn;
    for (const auto& [ebN0, state] : curve.points) {
        const Rates rates = sweep::ratesOf(state, curve.blockSize);
        if (rate == "bler") {
            drawn.push_back({ebN0, rates.bler, rates.blerInterval.low, rates.blerInterval.high, state.blocks,
                             state.last().blockErrors});
            continue;
        }
        const Interval interval = rates.ber > 0
                                      ? rates.berInterval
                                      : Interval{0, rates.blerInterval.high * wrongShareNear(curve, ebN0)};
        drawn.push_back({ebN0, rates.ber, interval.low, interval.high, state.blocks, state.last().bitErrors});
    }
    return drawn;
}

std::vector<DrawnPoint> pointsAfter(const SweepCurve& curve, const std::string& rate, std::size_t iteration) {
    std::vector<DrawnPoint> drawn;
    for (const auto& [ebN0, state] : curve.points) {
        const sweep::ErrorCount& count = state.counts.at(iteration - 1);
        const std::uint64_t errors = rate == "ber" ? count.bitErrors : count.blockErrors;
        const double trials = static_cast<double>(state.blocks) * (rate == "ber" ? curve.blockSize : 1.0);
        const double value = static_cast<double>(errors) / trials;
        drawn.push_back({ebN0, value, value, value, state.blocks, errors});
    }
    return drawn;
}

}  // namespace quarzel::tool
