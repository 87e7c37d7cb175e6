// SPDX-License-Identifier: MIT
#include "sweep/statistics.hpp"

#include <algorithm>
#include <cmath>

namespace quarzel::sweep {

namespace {

constexpr double deviations =
    1.959963984540054;  // within which a normal distribution lies in 95 % of all cases

Interval wilsonInterval(double errors, double trials) {
    constexpr double square = deviations * deviations;
    const double rate = errors / trials;
    const double centre = rate + square / (2 * trials);
    const double width = deviations * std::sqrt(rate * (1 - rate) / trials + square / (4 * trials * trials));
    const double whole = 1 + square / trials;
    return {errors == 0 ? 0 : (centre - width) / whole, errors == trials ? 1 : (centre + width) / whole};
}

Interval berInterval(const PointState& point, double K, double ber, double blerHigh) {
    const auto blocks = static_cast<double>(point.blocks);
    if (point.last().bitErrors == 0 || point.blocks < 2) {
        return {0, blerHigh};
    }
    const auto errors = static_cast<double>(point.last().bitErrors);
    const double variance =  // of the bit errors of a block
        (static_cast<double>(point.bitErrorSquares) - errors * (errors / blocks)) / (blocks - 1);
    const double width = deviations * std::sqrt(std::max(variance, 0.0) / blocks) / K;
    return {std::max(ber - width, 0.0), std::min(ber + width, 1.0)};
}

}  // namespace

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
