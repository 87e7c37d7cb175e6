// SPDX-License-Identifier: MIT
#include "plot/joined_curves.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace quarzel::test {

namespace {

using testing::ElementsAre;
using tool::joinedCurves;
using tool::MeasuredPoint;
using tool::SweepCurve;

MeasuredPoint point(double ebN0, std::uint64_t blocks, std::uint64_t errors) {
    MeasuredPoint point{ebN0, sweep::PointState(1)};
    point.state.blocks = blocks;
    point.state.counts.back() = {errors, errors};
    return point;
}

SweepCurve curve(std::uint64_t seed, const std::vector<MeasuredPoint>& points) {
    return {"a.json", false, 40, 2, 1, 8, {}, "", seed, 1.0 / 3, points};
}

std::vector<std::pair<double, std::uint64_t>> blocksOf(const SweepCurve& curve) {
    std::vector<std::pair<double, std::uint64_t>> blocks;
    for (const MeasuredPoint& point : curve.points) {
        blocks.emplace_back(point.ebN0, point.state.blocks);
    }
    return blocks;
}

using testing::Pair;

}  // namespace

TEST(JoinedCurves, AreOneLineOverSeveralRanges) {
    const auto joined =
        joinedCurves({curve(1, {point(1, 50, 5), point(2, 60, 1)}), curve(2, {point(0, 10, 9)})});
    ASSERT_EQ(joined.size(), 1U);
    EXPECT_THAT(blocksOf(joined[0]), ElementsAre(Pair(0, 10), Pair(1, 50), Pair(2, 60)));
}

TEST(JoinedCurves, TakeTheLongerMeasurementOfAPoint) {
    const auto joined = joinedCurves(
        {curve(1, {point(0, 10, 9), point(1, 50, 5)}), curve(1, {point(1, 500, 52), point(2, 60, 1)})});
    ASSERT_EQ(joined.size(), 1U);
    EXPECT_THAT(blocksOf(joined[0]), ElementsAre(Pair(0, 10), Pair(1, 500), Pair(2, 60)));
}

TEST(JoinedCurves, StayApartWhereTheyAreTwoMeasurements) {
    EXPECT_EQ(joinedCurves({curve(1, {point(1, 50, 5)}), curve(2, {point(1, 50, 5)})}).size(), 2U)
        << "two seeds";
    EXPECT_EQ(joinedCurves({curve(1, {point(1, 50, 5)}), curve(1, {point(1, 50, 6)})}).size(), 2U)
        << "other errors of the same blocks";
    SweepCurve other = curve(1, {point(2, 50, 5)});
    other.blockSize = 48;
    EXPECT_EQ(joinedCurves({curve(1, {point(1, 50, 5)}), other}).size(), 2U) << "another block size";
}

}  // namespace quarzel::test
