// SPDX-License-Identifier: MIT
#include "sweep/predicted_cost.hpp"

#include <algorithm>
#include <cmath>

namespace quarzel::sweep {

namespace {

/// Iterations of max-log that take as long as bits, encoder, noise and counting.
constexpr double iterationsOfTheRest = 2.7;
/// How much longer an iteration of max-star takes.
constexpr double factorOfMaxStar = 3;

double usualErrorRate(const Setup& setup) {
    const auto [start, perDecade] = usualWaterfall(setup);
    double decades = (setup.ebN0.value() - start) / perDecade;
    if (decades < 0) {
        return std::min(0.1 - decades / 3, 1.0);
    }
    double rate = 0.1;
    for (; decades > 0 && rate > 1e-15; decades -= 0.1) {
        rate *= 0.7943282347242815;  // a tenth of a decade
    }
    return rate;
}

}  // namespace

Waterfall usualWaterfall(const Setup& curve) {
    const double root = std::sqrt(static_cast<double>(curve.blockSize));
    const double iterations = curve.iterations;
    const double ofIterations = (9 - 44 / root) * (1 / (iterations * iterations) - 1.0 / 64);
    const double ofAlgorithm = curve.algorithm == 0   ? 0.25 - 1 / root
                               : curve.algorithm == 2 ? 0.75 / root - 0.12
                                                      : 0;
    return {0.42 + 5 / root + ofIterations + ofAlgorithm, 0.05 + 6 / root};
}

double predictedCost(const Setup& setup, const StopRule& rule) {
    const double perBlock =
        setup.informationBits() *
        (iterationsOfTheRest + setup.iterations * (setup.algorithm == 2 ? factorOfMaxStar : 1));
    const auto most = static_cast<double>(rule.maxBlocks);
    const double untilErrors = static_cast<double>(rule.maxBlockErrors) / usualErrorRate(setup);
    return perBlock * (rule.maxBlockErrors == 0 ? most : std::min(most, untilErrors));
}

}  // namespace quarzel::sweep
