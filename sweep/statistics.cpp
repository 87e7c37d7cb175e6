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

/// See Rates::berInterval. The ends solve (ber - p)^2 = z^2 s p / n, where s is the measured variance over
/// the mean of the bit errors of a block and n the blocks.
Interval berInterval(const PointState& point, double ber, double blerHigh) {
    if (point.last().bitErrors == 0 || point.blocks < 2) {
        return {0, blerHigh};
    }
    const auto errors = static_cast<double>(point.last().bitErrors);
    const double square =  // (z times the relative deviation of the rate) squared
        deviations * deviations * varianceOf(point) * static_cast<double>(point.blocks) / (errors * errors);
    const double factor = 1 + square / 2 + std::sqrt(square * (1 + square / 4));
    return {ber / factor, std::min(ber * factor, 1.0)};
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
    rates.berInterval = berInterval(point, rates.ber, rates.blerInterval.high);
    return rates;
}

std::uint64_t blocksSent(const PointState& point, std::size_t transmission) {
    if (transmission == 0) {
        return point.blocks;
    }
    const ErrorCount& before = point.counts.at(transmission - 1);
    return before.blockErrors - before.undetected;
}

double throughput(const Setup& setup, const PointState& point, std::size_t count) {
    std::uint64_t sent = point.blocks;
    for (std::size_t t = 1; setup.transmissions() > 1 && t <= count; ++t) {
        sent += blocksSent(point, t);
    }
    if (sent == 0) {
        return 0;
    }
    const std::uint64_t right = point.blocks - point.counts.at(count).blockErrors;
    return static_cast<double>(right) * setup.informationBits() /
           (static_cast<double>(sent) * setup.codedBits());
}

double meanIterations(const PointState& point) {
    std::uint64_t times = 0;
    std::uint64_t iterations = 0;
    for (std::size_t i = 0; i < point.iterationsUsed.size(); ++i) {
        times += point.iterationsUsed[i];
        iterations += point.iterationsUsed[i] * (i + 1);
    }
    return times == 0 ? 0 : static_cast<double>(iterations) / static_cast<double>(times);
}

}  // namespace quarzel::sweep
