// SPDX-License-Identifier: MIT
#include "plot/joined_curves.hpp"

#include <algorithm>
#include <tuple>
#include <utility>

namespace quarzel::tool {

namespace {

auto setupOf(const SweepCurve& curve) {
    return std::tie(curve.isTransportBlock, curve.blockSize, curve.units, curve.algorithm, curve.iterations,
                    curve.quantiser, curve.sending, curve.bitsPerSymbol);
}

std::vector<MeasuredPoint>::iterator pointAt(SweepCurve& curve, double ebN0) {
    return std::find_if(curve.points.begin(), curve.points.end(),
                        [&](const MeasuredPoint& point) { return point.ebN0 == ebN0; });
}

bool contradict(const sweep::PointState& a, const sweep::PointState& b) {
    return a.blocks == b.blocks && std::pair(a.last().bitErrors, a.bitErrorSquares) !=
                                       std::pair(b.last().bitErrors, b.bitErrorSquares);
}

bool areOne(SweepCurve& curve, const SweepCurve& other) {
    return setupOf(curve) == setupOf(other) &&
           std::all_of(other.points.begin(), other.points.end(), [&](const MeasuredPoint& point) {
               const auto same = pointAt(curve, point.ebN0);
               return same == curve.points.end() ||
                      (curve.seed == other.seed && !contradict(same->state, point.state));
           });
}

void join(SweepCurve& curve, SweepCurve other) {
    for (MeasuredPoint& point : other.points) {
        const auto same = pointAt(curve, point.ebN0);
        if (same == curve.points.end()) {
            curve.points.push_back(std::move(point));
        } else if (same->state.blocks < point.state.blocks) {
            *same = std::move(point);
        }
    }
}

}  // namespace

std::vector<SweepCurve> joinedCurves(std::vector<SweepCurve> curves) {
    std::vector<SweepCurve> joined;
    for (SweepCurve& curve : curves) {
        const auto first = std::find_if(joined.begin(), joined.end(),
                                        [&](SweepCurve& candidate) { return areOne(candidate, curve); });
        if (first == joined.end()) {
            joined.push_back(std::move(curve));
        } else {
            join(*first, std::move(curve));
        }
    }
    for (SweepCurve& curve : joined) {
        std::sort(curve.points.begin(), curve.points.end(),
                  [](const MeasuredPoint& a, const MeasuredPoint& b) { return a.ebN0 < b.ebN0; });
    }
    return joined;
}

}  // namespace quarzel::tool
