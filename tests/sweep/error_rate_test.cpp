// SPDX-License-Identifier: MIT
// Block error rates against figures of a link simulation that shares no code with this one: K = 1024, 2
// units, 8 iterations, soft values round(8 y / sigma^2), 4000 blocks a point.
#include <gtest/gtest.h>

#include <cmath>

#include "support/random.hpp"
#include "sweeps.hpp"

namespace quarzel::test {

namespace {

constexpr double figureBlocks = 4000;

struct Figure {
    int algorithm;
    link::Decibels ebN0;
    double bler;
};

constexpr Figure figures[] = {
    {1, {400'000}, 0.34}, {1, {600'000}, 0.12},  {1, {800'000}, 0.021},
    {0, {600'000}, 0.42}, {0, {800'000}, 0.15},  {0, {1'000'000}, 0.030},
    {2, {400'000}, 0.21}, {2, {600'000}, 0.048}, {2, {800'000}, 0.0065},
};

}  // namespace

// Both sides are counts of independent blocks. Five of their common standard deviations, and half a unit of
// the figure's last digit: a right simulation fails here less than once in 100,000 times.
TEST(ErrorRates, LieNearIndependentFigures) {
    const std::uint64_t seed = seededRandom()();
    for (const Figure& figure : figures) {
        sweep::Configuration configuration;
        configuration.algorithms = {figure.algorithm};
        configuration.iterations = {8};
        configuration.quantisers = {{link::Quantiser::Kind::llr, 4}};  // 4 L = 8 y / sigma^2
        configuration.ebN0 = {figure.ebN0};
        configuration.stopRule.maxBlocks = 320;
        configuration.stopRule.maxBlockErrors = 0;
        configuration.seed = seed;
        const sweep::PointState point = resultOf(configuration).points.begin()->second;
        const auto blocks = static_cast<double>(point.blocks);
        const double bler = static_cast<double>(point.last().blockErrors) / blocks;
        const double deviation = std::sqrt(figure.bler * (1 - figure.bler) * (1 / blocks + 1 / figureBlocks));
        EXPECT_NEAR(bler, figure.bler, 5 * deviation + 0.005)
            << "type " << figure.algorithm << ", " << figure.ebN0.value() << " dB";
    }
}

}  // namespace quarzel::test
