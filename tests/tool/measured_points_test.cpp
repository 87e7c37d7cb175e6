// SPDX-License-Identifier: MIT
#include "plot/measured_points.hpp"

#include <gtest/gtest.h>

namespace quarzel::test {

namespace {

tool::MeasuredPoint point(double ebN0, sweep::ErrorCount count) {
    tool::MeasuredPoint point{ebN0, sweep::PointState(1)};
    point.state.blocks = 10000;
    point.state.counts.back() = count;
    point.state.bitErrorSquares = 12 * count.bitErrors;
    return point;
}

tool::SweepCurve curve(const std::vector<tool::MeasuredPoint>& points) {
    return {"a.json", false, 1024, 2, 1, 8, {}, "", 7, 1.0 / 3, points};
}

}  // namespace

TEST(MeasuredPoints, TakeTheBoundOfBitErrorsFromTheNearestPointWithErrors) {
    const tool::SweepCurve measured =
        curve({point(0, {51200, 500}), point(1, {1024, 100}), point(2, {0, 0})});
    const double blocks = measuredPoints(measured, "bler")[2].high;
    EXPECT_NEAR(blocks, 3.84e-4, 1e-6);
    // 10.24 of 1024 bits are wrong in a wrong block at 1 dB.
    EXPECT_DOUBLE_EQ(measuredPoints(measured, "ber")[2].high, blocks * 0.01);
}

TEST(MeasuredPoints, BoundBitErrorsByBlockErrorsWhereNothingElseIsKnown) {
    const tool::SweepCurve silent = curve({point(0, {0, 0})});
    EXPECT_EQ(measuredPoints(silent, "ber")[0].high, measuredPoints(silent, "bler")[0].high);
}

TEST(MeasuredPoints, HaveIntervalsOfTheBitErrorRateThatDoNotReachZero) {
    const tool::DrawnPoint one = measuredPoints(curve({point(0, {12, 1})}), "ber")[0];
    EXPECT_GT(one.low, 0);
    EXPECT_NEAR(one.rate / one.low, one.high / one.rate, 1e-9) << "the rate is in the middle of the axis";
}

}  // namespace quarzel::test
