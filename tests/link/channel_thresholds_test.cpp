// SPDX-License-Identifier: MIT
#include "link/channel_thresholds.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "quarzel/quantise.hpp"

namespace {

using namespace quarzel::link;

constexpr double whole = 281474976710656.0;  // 2^48

TEST(ChannelThresholds, AreThoseOfTheGaussianDistribution) {
    for (const Quantiser& quantiser :
         {Quantiser{Quantiser::Kind::llr, 4}, Quantiser{Quantiser::Kind::amplitude, 8},
          Quantiser{Quantiser::Kind::amplitude, 100}}) {
        for (const Decibels ebN0 : {Decibels{-2000000}, Decibels{0}, Decibels{600000}, Decibels{5000000}}) {
            const double variance = 1.5 * std::pow(10, -ebN0.value() / 10);
            EXPECT_NEAR(noiseVariance(ebN0), variance, 1e-15);
            const double units =
                quantiser.scale * (quantiser.kind == Quantiser::Kind::llr ? 2 / variance : 1.0);
            const ChannelThresholds thresholds = channelThresholds(quantiser, ebN0);
            for (std::size_t i = 0; i < thresholds.size(); ++i) {
                const double y = (static_cast<double>(i) - 127.5) / units;
                const double below = std::erfc((1 - y) / std::sqrt(2 * variance)) / 2;
                EXPECT_NEAR(static_cast<double>(thresholds[i]) / whole, below, 1e-13) << i;
            }
        }
    }
}

// Worked out with 60 decimal digits by another program: they must not differ on any machine.
TEST(ChannelThresholds, AreExactToTheLastUnit) {
    const ChannelThresholds thresholds = channelThresholds({Quantiser::Kind::llr, 4}, {600000});
    EXPECT_EQ(thresholds[0], 0U);
    EXPECT_EQ(thresholds[100], 218940438U);
    EXPECT_EQ(thresholds[127], 48410976769679U);
    EXPECT_EQ(thresholds[170], 281474948251036U);
    EXPECT_EQ(thresholds[255], 281474976710656U);
}

// The channel draws soft values from thresholds, receivers quantise what they have received: one rule.
TEST(ChannelThresholds, AreThoseOfTheFunctionThatQuantises) {
    constexpr double nearly = 0.49;
    for (const Decibels ebN0 : {Decibels{0}, Decibels{4000000}}) {
        const double variance = noiseVariance(ebN0);
        for (const Quantiser& quantiser :
             {Quantiser{Quantiser::Kind::llr, 4}, Quantiser{Quantiser::Kind::amplitude, 20}}) {
            const double ratio = quantiser.kind == Quantiser::Kind::llr ? 2 / variance : 1.0;
            const ChannelThresholds thresholds = channelThresholds(quantiser, ebN0);
            for (int soft = -20; soft <= 40; ++soft) {
                for (const double part : {-nearly, 0.0, nearly}) {
                    const double y = (soft + part) / (quantiser.scale * ratio);
                    const double value = y * ratio;
                    std::int8_t quantised = 0;
                    quarzel::quantise(std::span(&value, 1), std::span(&quantised, 1), quantiser.scale);
                    ASSERT_EQ(quantised, soft);
                    const auto random =
                        static_cast<std::uint64_t>(whole * std::erfc((1 - y) / std::sqrt(2 * variance)) / 2);
                    const auto above = std::upper_bound(thresholds.begin(), thresholds.end(), random);
                    EXPECT_EQ(lowestOutput + (above - thresholds.begin()), soft) << "y = " << y;
                }
            }
        }
    }
}

}  // namespace
