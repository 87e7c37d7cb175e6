// SPDX-License-Identifier: MIT
// The metric record and its two comparisons.
#include "engine/t8.hpp"

#include <gtest/gtest.h>

#include <cstdint>

namespace quarzel::test {
namespace {

constexpr T8 sample = {{0, 1, -1, 32767, -32768, 5, 6, 7}};

TEST(MetricRecord, IsEightWordsInStateOrder) {
    EXPECT_EQ(sizeof(T8), 16U);
    for (std::size_t state = 0; state < 8; ++state) {
        EXPECT_EQ(&sample[state], sample.element + state);
    }
}

TEST(MetricRecord, EqualsItsCopyInBothComparisons) {
    const T8 copy = sample;
    EXPECT_TRUE(compareT8(sample, copy));
    EXPECT_TRUE(compareT8_4(sample, copy));
}

TEST(MetricRecord, IsComparedInEveryBitOfAllEightElements) {
    for (std::size_t state = 0; state < 8; ++state) {
        for (unsigned bit = 0; bit < 16; ++bit) {
            T8 other = sample;
            other[state] = static_cast<std::int16_t>(other[state] ^ (1 << bit));
            EXPECT_FALSE(compareT8(sample, other)) << state << ", " << bit;
            EXPECT_FALSE(compareT8(other, sample)) << state << ", " << bit;
        }
    }
}

TEST(MetricRecord, IsComparedInItsFirstFourElementsForBranchMetrics) {
    for (std::size_t state = 0; state < 8; ++state) {
        T8 other = sample;
        other[state] = 1000;
        EXPECT_EQ(compareT8_4(sample, other), state >= 4) << state;
        EXPECT_EQ(compareT8_4(other, sample), state >= 4) << state;
    }
}

}  // namespace
}  // namespace quarzel::test
