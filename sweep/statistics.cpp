// SPDX-License-Identifier: MIT
#include "sweep/statistics.hpp"

#include <algorithm>
#include <cmath>

namespace quarzel::sweep {

namespace {

Interval wilsonInterval(double errors, double trials) {
    constexpr double square = deviations * deviations;
    const double rate = errors / trials;
    const double centre = rate + square / (2 * trials);
    const double width = deviations * std::sqrt(rate * (1 - rate) / trials + square / (4 * trials * trials));
    const double whole = 1 + square / trials;
    return {errors == 0 ? 0 : (centre - width) / whole, errors == trials ? 1 : (centre + width) / whole};
}

/// The variance of the bit errors of a block, of which there are at least 2.
double varianceOf(const PointState& point) {
    const auto blocks = static_cast<double>(point.blocks);
    const auto errors = static_cast<double>(point.last().bitErrors);
    const double squares = static_cast<double>(point.bitErrorSquares) - errors * (errors / blocks);
    return std::max(squares / (blocks - 1), 0.0);
}

Interval berInterval(const PointState& point, double K, double ber, double blerHigh) {
    if (point.last().bitErrors == 0 || point.blocks < 2) {
        return {0, blerHigh};
    }
    const double width = deviations * std::sqrt(varianceOf(point) / static_cast<double>(point.blocks)) / K;
    return {std::max(ber - width, 0.0), std::min(ber + width, 1.0)};
}

}  // namespace

Interval berScoreInterval(const PointState& point, std::uint32_t blockSize) {
    const Rates rates = ratesOf(point, blockSize);
    if (point.last().bitErrors == 0 || point.blocks < 2) {
        return rates.berInterval;
    }
    const auto errors = static_cast<double>(point.last().bitErrors);
    const double square =  // (z times the relative deviation of the rate) squared
        deviations * deviations * varianceOf(point) * static_cast<double>(point.blocks) / (errors * errors);
    const double factor = 1 + square / 2 + std::sqrt(square * (1 + square / 4));
    return {rates.ber / factor, std::min(rates.ber * factor, 1.0)};
}

Rates ratesOf(const PointState& point, std::uint32_t blockSize) {
    if (point.blocks == 0) {
        return {0, 0, {0, 1}, {0, 1}};
    }
    const auto blocks = static_cast<double>(point.blocks);
    const auto K = static_cast<double>(blockSize);
    Rates rates{};
    rates.ber = static_cast<double>(point.last().bitErrors) / (blocks * K);
    rates.bler = static_cast<double>(point.last().blockErrors) / blocks;
    rates.blerInterval = wilsonInterval(static_cast<double>(point.last().blockErrors), blocks);
    rates.berInterval = berInterval(point, K, rates.ber, rates.blerInterval.high);
    return rates;
}

}  // namespace quarzel::sweep
