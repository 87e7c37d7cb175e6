// SPDX-License-Identifier: MIT
// Branch metrics: the four sign patterns of the soft values, and their clamp.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <vector>

#include "engine/probe_engine.hpp"
#include "support/random.hpp"
#include "support/rows.hpp"

namespace quarzel::test {
namespace {

using Metrics = std::vector<int>;

/// The branch metrics of one step; the elements after them must keep what they held.
Metrics gamma(const ProbeEngine& engine, short intrinsic, short parity0, short parity1) {
    T8 record = {{1, 2, 3, 4, 55, 66, 77, 88}};
    EXPECT_EQ(engine.mod_gamma(1, &intrinsic, &parity0, &parity1, &record), &record + 1);
    EXPECT_EQ(record[4], 55);
    EXPECT_EQ(record[5], 66);
    EXPECT_EQ(record[6], 77);
    EXPECT_EQ(record[7], 88);
    return {record[0], record[1], record[2], record[3]};
}

TEST(BranchMetrics, AreTheSignPatternsOfTheParitiesAroundTwiceTheIntrinsicValue) {
    const ProbeEngine engine;
    EXPECT_EQ(gamma(engine, 0, 0, 0), Metrics({0, 0, 0, 0}));
    EXPECT_EQ(gamma(engine, 16, 0, 0), Metrics({32, 32, 32, 32}));
    EXPECT_EQ(gamma(engine, 0, 16, 0), Metrics({16, -16, -16, 16}));
    EXPECT_EQ(gamma(engine, 0, 0, 16), Metrics({16, 16, -16, -16}));
    EXPECT_EQ(gamma(engine, 100, 30, 7), Metrics({237, 177, 163, 223}));
    EXPECT_EQ(gamma(engine, -100, 30, 7), Metrics({-163, -223, -237, -177}));
    EXPECT_EQ(gamma(engine, 1, 0, 1), Metrics({3, 3, 1, 1}));
}

TEST(BranchMetrics, AreClampedToTheBranchFormat) {
    const ProbeEngine engine;
    EXPECT_EQ(gamma(engine, 1016, 0, 0), Metrics({2032, 2032, 2032, 2032}));
    EXPECT_EQ(gamma(engine, 1016, 1, 0), Metrics({2032, 2031, 2031, 2032}));
    EXPECT_EQ(gamma(engine, 1017, 0, 0), Metrics({2032, 2032, 2032, 2032}));
    EXPECT_EQ(gamma(engine, -1024, 0, 0), Metrics({-2048, -2048, -2048, -2048}));
    EXPECT_EQ(gamma(engine, -1024, 1, 0), Metrics({-2047, -2048, -2048, -2047}));
    EXPECT_EQ(gamma(engine, -1025, 0, 0), Metrics({-2048, -2048, -2048, -2048}));
    EXPECT_EQ(gamma(engine, 32767, 32767, 32767), Metrics({2032, 2032, 0, 2032}));
    EXPECT_EQ(gamma(engine, -32768, -32768, -32768), Metrics({-2048, -2048, 0, -2048}));
}

TEST(BranchMetrics, SaturateAndDoNotWrapInAFullWidthFormat) {
    const ProbeEngine engine({16, 4}, {16, 4});
    EXPECT_EQ(gamma(engine, 20000, 0, 0), Metrics({32767, 32767, 32767, 32767}));
    EXPECT_EQ(gamma(engine, -20000, 0, 0), Metrics({-32768, -32768, -32768, -32768}));
    EXPECT_EQ(gamma(engine, 16383, 1, 0), Metrics({32767, 32765, 32765, 32767}));
    EXPECT_EQ(gamma(engine, 16383, 2, 0), Metrics({32767, 32764, 32764, 32767}));
    EXPECT_EQ(gamma(engine, 32767, -32768, -32768), Metrics({-2, 32767, 32767, 32767}));
}

TEST(BranchMetrics, AreClampedToTheBranchFormatInTheAlignmentOfTheStateFormat) {
    EXPECT_EQ(gamma(ProbeEngine({10, 2}, {6, 2}), 32767, 0, 0), Metrics({1984, 1984, 1984, 1984}));
    EXPECT_EQ(gamma(ProbeEngine({10, 2}, {6, 2}), -32768, 0, 0), Metrics({-2048, -2048, -2048, -2048}));
    EXPECT_EQ(gamma(ProbeEngine({16, 3}, {8, 3}), 32767, 0, 0), Metrics({127, 127, 127, 127}));
    EXPECT_EQ(gamma(ProbeEngine({12, 3}, {12, 3}), 32767, 0, 0), Metrics({32752, 32752, 32752, 32752}));
}

TEST(BranchMetrics, HaveTheirBoundsKeptTo16BitsInABranchFormatWiderThanTheStateFormat) {
    // 32767 * 16 and -32768 * 16 wrap to -16 and 0; the upper bound is looked at first.
    const ProbeEngine engine({12, 3}, {16, 3});
    EXPECT_EQ(gamma(engine, 100, 0, 0), Metrics({-16, -16, -16, -16}));
    EXPECT_EQ(gamma(engine, 0, 15, 0), Metrics({-16, -16, -16, -16}));
    EXPECT_EQ(gamma(engine, -8, 0, 0), Metrics({0, 0, 0, 0}));
    EXPECT_EQ(gamma(engine, -100, 0, 0), Metrics({0, 0, 0, 0}));
}

TEST(BranchMetrics, AreComputedInFullPrecisionForAnySoftValues) {
    std::mt19937 random = seededRandom();
    for (const TNumberFormat& branch : {TNumberFormat(8, 3), TNumberFormat(12, 3)}) {
        const ProbeEngine engine({12, 3}, branch);
        const auto clamp = [&branch](std::int64_t value) {
            return static_cast<int>(std::clamp<std::int64_t>(value, branch.minQ * 16, branch.maxQ * 16));
        };
        for (int repetition = 0; repetition < 20000; ++repetition) {
            const short a = randomWord(random);
            const short b = randomWord(random);
            const short c = randomWord(random);
            const std::int64_t twice = std::int64_t{2} * a;
            ASSERT_EQ(gamma(engine, a, b, c), Metrics({clamp(twice + b + c), clamp(twice - b + c),
                                                       clamp(twice - b - c), clamp(twice + b - c)}))
                << a << ", " << b << ", " << c;
        }
    }
}

TEST(BranchMetrics, OfEachStepComeFromItsOwnSoftValues) {
    const ProbeEngine engine;
    const std::vector<short> intrinsic = {10, -20, 30};
    const std::vector<short> parity0 = {1, 2, -3};
    const std::vector<short> parity1 = {0, 100, 200};
    std::vector<T8> records(3);
    EXPECT_EQ(engine.mod_gamma(3, intrinsic.data(), parity0.data(), parity1.data(), records.data()),
              records.data() + 3);
    EXPECT_EQ(rows(records), std::vector<Row>({{21, 19, 19, 21, 0, 0, 0, 0},
                                               {62, 58, -142, -138, 0, 0, 0, 0},
                                               {257, 263, -137, -143, 0, 0, 0, 0}}));
}

}  // namespace
}  // namespace quarzel::test
