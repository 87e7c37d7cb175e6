// SPDX-License-Identifier: MIT
#include "interface/soft_input.hpp"

#include <gtest/gtest.h>

#include <algorithm>

#include "support/model.hpp"

namespace quarzel::test {
namespace {

const TNumberFormat inputFormat(8, 3);
const TNumberFormat stateFormat(12, 3);

short convert(int value, int* saturated = nullptr) {
    int ignored = 0;
    return toSoftValue(value, inputFormat, stateFormat, saturated != nullptr ? *saturated : ignored);
}

/// A block of ints as a call holds it.
BlockCall callOf(const Block& block) {
    const vardel_ip_quarzel_inputs inputs = block.inputs();
    vardel_ip_quarzel_outputs outputs{};
    return RecordSource(&outputs, &inputs).block(0);
}

TEST(SoftInput, ScalesBy16AndSaturatesToEightBits) {
    EXPECT_EQ(convert(127), 2032);
    EXPECT_EQ(convert(-128), -2048);
    EXPECT_EQ(convert(200), 2032);
    EXPECT_EQ(convert(-129), -2048);
    EXPECT_EQ(convert(0), 0);
    EXPECT_EQ(convert(-1), -16);
}

TEST(SoftInput, EveryValueBelow2To23IsClampedAndTold) {
    for (int value = -(1 << 23); value < (1 << 23); ++value) {
        int saturated = 9;
        const short word = convert(value, &saturated);
        ASSERT_EQ(word, 16 * std::clamp(value, -128, 127)) << value;
        ASSERT_EQ(saturated, value > 127 ? 1 : value < -128 ? -1 : 0) << value;
    }
}

TEST(SoftInput, LargerMagnitudesWrapBeforeTheComparison) {
    for (const int value : {1 << 24, -(1 << 24), 1 << 30, -2147483647 - 1, 5 << 24}) {
        int saturated = 9;
        EXPECT_EQ(convert(value, &saturated), 0) << value;
        EXPECT_EQ(saturated, 0) << value;
    }
    int saturated = 0;
    EXPECT_EQ(convert((1 << 24) + 3, &saturated), 48);
    EXPECT_EQ(saturated, 0);
    EXPECT_EQ(convert(1 << 23, &saturated), -2048);
    EXPECT_EQ(saturated, -1);
    EXPECT_EQ(convert(-(1 << 23) - 1, &saturated), 2032);
    EXPECT_EQ(saturated, 1);
    EXPECT_EQ(convert(2147483647, &saturated), -16);
    EXPECT_EQ(saturated, 0);
}

TEST(SoftInput, OtherFormatsAreRequantisedToTheStateFormat) {
    const TNumberFormat narrowState(6, 3);
    int saturated = 0;
    EXPECT_EQ(toSoftValue(31, inputFormat, narrowState, saturated), 31 * 1024);
    EXPECT_EQ(toSoftValue(32, inputFormat, narrowState, saturated), narrowState.max);
    EXPECT_EQ(toSoftValue(-33, inputFormat, narrowState, saturated), narrowState.min);
    EXPECT_EQ(saturated, 0);
}

TEST(SoftInput, ALimitOfTheStateFormatIsForWhatLiesBeyondIt) {
    TNumberFormat limited = stateFormat;
    limited.minQ = -5;
    limited.min = -7 * 16;
    limited.maxQ = 5;
    limited.max = 7 * 16;
    int saturated = 0;
    EXPECT_EQ(toSoftValue(-6, inputFormat, limited, saturated), -7 * 16);
    EXPECT_EQ(toSoftValue(-5, inputFormat, limited, saturated), -5 * 16);
    EXPECT_EQ(toSoftValue(5, inputFormat, limited, saturated), 5 * 16);
    EXPECT_EQ(toSoftValue(6, inputFormat, limited, saturated), 7 * 16);
}

TEST(SoftInput, PositionsInterleaveTheThreeStreams) {
    const Block block({1, 2, 3}, {4, 5, 6}, {7, 8, 9}, 1, 0);
    std::vector<short> soft;
    toSoftValues(callOf(block), inputFormat, stateFormat, soft);
    EXPECT_FALSE(findSaturation(callOf(block), inputFormat));
    EXPECT_EQ(soft, (std::vector<short>{16, 64, 112, 32, 80, 128, 48, 96, 144}));
}

TEST(SoftInput, TellsTheFirstSaturatedValueInPositionOrder) {
    const Block block({1, 2, -500}, {4, 5, 6}, {7, 300, 9}, 1, 0);
    std::vector<short> soft;
    toSoftValues(callOf(block), inputFormat, stateFormat, soft);
    const auto first = findSaturation(callOf(block), inputFormat);
    ASSERT_TRUE(first);
    EXPECT_EQ(first->position, 1);
    EXPECT_EQ(first->stream, 2U);
    EXPECT_TRUE(first->positive);
    EXPECT_EQ(soft, (std::vector<short>{16, 64, 112, 32, 80, 2032, -2048, 96, 144}));
}

}  // namespace
}  // namespace quarzel::test
