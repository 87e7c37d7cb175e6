// SPDX-License-Identifier: MIT
#include "vectors/stimulus_source.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "quarzel/code.hpp"

namespace quarzel::test {

namespace {

using tool::Stimulus;

constexpr std::uint32_t K = 512;
constexpr std::uint32_t units = 2;

std::vector<std::int8_t> soft(Stimulus stimulus, std::uint32_t number = 0, std::uint64_t seed = 1) {
    tool::VectorRequest request;
    request.seed = seed;
    request.ebN0.micro = -2000000;
    return tool::StimulusSource(request).make({K, 6, stimulus, number}, units);
}

/// Positions of a block whose values are not 8 or -8, modulo the length of a stream.
std::set<std::size_t> noisyPositions(const std::vector<std::int8_t>& values) {
    std::set<std::size_t> positions;
    for (std::size_t i = 0; i < values.size(); ++i) {
        if (values[i] != 8 && values[i] != -8) {
            positions.insert(i % (K + 4));
        }
    }
    return positions;
}

void expectBothOf(Stimulus stimulus, std::int8_t low, std::int8_t high) {
    const std::vector<std::int8_t> values = soft(stimulus);
    ASSERT_EQ(values.size(), 3U * (K + 4));
    const auto lows = std::count(values.begin(), values.end(), low);
    EXPECT_EQ(lows + std::count(values.begin(), values.end(), high), 3 * (K + 4));
    EXPECT_GT(lows, K);
    EXPECT_LT(lows, 2 * K) << "as many of both, but for chance";
}

}  // namespace

TEST(StimulusSource, GivesWhatTheNamesSay) {
    EXPECT_EQ(soft(Stimulus::zero), std::vector<std::int8_t>(3 * (K + 4)));
    expectBothOf(Stimulus::fullScale, -128, 127);
    expectBothOf(Stimulus::saturating, -128, 127);
    expectBothOf(Stimulus::ties, -8, 8);
}

TEST(StimulusSource, KeepsNoiseInItsSegment) {
    const std::size_t steps = layout(K, units).segment_steps;
    ASSERT_LT(2 * steps, K);
    const std::set<std::size_t> first = noisyPositions(soft(Stimulus::firstSegment));
    EXPECT_GT(first.size(), steps / 2);
    EXPECT_LT(*first.rbegin(), steps);
    const std::set<std::size_t> last = noisyPositions(soft(Stimulus::lastSegment));
    EXPECT_GT(last.size(), steps / 2);
    EXPECT_GE(*last.begin(), K - steps);
    EXPECT_GT(noisyPositions(soft(Stimulus::noise)).size(), K / 2);
}

TEST(StimulusSource, DependsOnSeedStimulusAndNumber) {
    const std::set<std::vector<std::int8_t>> different = {
        soft(Stimulus::noise),      soft(Stimulus::noise, 1),      soft(Stimulus::noise, 0, 2),
        soft(Stimulus::saturating), soft(Stimulus::saturating, 1), soft(Stimulus::fullScale)};
    EXPECT_EQ(different.size(), 6U);
    EXPECT_EQ(soft(Stimulus::noise, 1), soft(Stimulus::noise, 1));
}

}  // namespace quarzel::test
