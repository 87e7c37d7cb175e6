// SPDX-License-Identifier: MIT
#include "sweep/statistics.hpp"

#include <gtest/gtest.h>

#include <cmath>

namespace quarzel::test {

namespace {

sweep::PointState pointOf(std::uint64_t blocks, const std::vector<std::uint32_t>& bitErrors) {
    sweep::PointState point;
    point.blocks = blocks;
    for (const std::uint32_t errors : bitErrors) {
        point.add(&errors);
    }
    return point;
}

}  // namespace

// The examples of the formula: 15 of 148 and 81 of 263 (R. G. Newcombe, 1998, Table I, method 3).
TEST(Rates, HaveThePublishedWilsonInterval) {
    const sweep::Rates few = sweep::ratesOf(pointOf(148, std::vector<std::uint32_t>(15, 1)), 40);
    EXPECT_NEAR(few.blerInterval.low, 0.0624, 5e-5);
    EXPECT_NEAR(few.blerInterval.high, 0.1605, 5e-5);
    const sweep::Rates many = sweep::ratesOf(pointOf(263, std::vector<std::uint32_t>(81, 1)), 40);
    EXPECT_NEAR(many.blerInterval.low, 0.2553, 5e-5);
    EXPECT_NEAR(many.blerInterval.high, 0.3662, 5e-5);
}

TEST(Rates, TellWhatIsKnownWithoutAnError) {
    const sweep::Rates rates = sweep::ratesOf(pointOf(1000, {}), 40);
    EXPECT_EQ(rates.ber, 0);
    EXPECT_EQ(rates.bler, 0);
    EXPECT_EQ(rates.blerInterval.low, 0);
    EXPECT_NEAR(rates.blerInterval.high, 0.00383, 1e-5);  // about 3.84 / (1000 + 3.84)
    EXPECT_EQ(rates.berInterval.low, 0);
    EXPECT_EQ(rates.berInterval.high, rates.blerInterval.high);
}

TEST(Rates, EndAtOneWhenEveryBlockIsWrong) {
    const sweep::Rates rates = sweep::ratesOf(pointOf(3, {40, 40, 40}), 40);
    EXPECT_EQ(rates.bler, 1);
    EXPECT_EQ(rates.blerInterval.high, 1);
    EXPECT_EQ(rates.ber, 1);
    EXPECT_EQ(rates.berInterval.high, 1);
}

// 4 blocks with 0, 0, 3 and 5 bit errors: mean 2, variance (4 + 4 + 1 + 9) / 3 = 6. The ends solve
// (2 - p)^2 = 1.96^2 * (6 / 2) * p / 4.
TEST(Rates, TakeTheSpreadOfBitErrorsFromTheBlocks) {
    const sweep::Rates rates = sweep::ratesOf(pointOf(4, {3, 5}), 40);
    EXPECT_DOUBLE_EQ(rates.ber, 8.0 / 160);
    for (const double p : {rates.berInterval.low * 40, rates.berInterval.high * 40}) {
        const double z = 1.959963984540054;
        EXPECT_NEAR((2 - p) * (2 - p), z * z * (6.0 / 2) * p / 4, 1e-9);
    }
    EXPECT_GT(rates.berInterval.low, 0);
    EXPECT_LT(rates.berInterval.low, 0.05);
    EXPECT_GT(rates.berInterval.high, 0.05);
}

}  // namespace quarzel::test
