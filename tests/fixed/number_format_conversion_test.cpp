// SPDX-License-Identifier: MIT
// Between the words of a format, its integers and the real numbers they stand for.
#include <gtest/gtest.h>

#include <cstdint>

#include "fixed/number_format.hpp"

namespace quarzel::test {
namespace {

TEST(NumberFormatConversion, BringsEveryIntegerOfEveryWidthToAWordAndBack) {
    for (std::uint32_t nbits = 1; nbits <= 16; ++nbits) {
        const TNumberFormat format(nbits, 3);
        for (std::int32_t q = format.minQ; q <= format.maxQ; ++q) {
            const std::int16_t word = format.toWord(q);
            ASSERT_EQ(word, q * (1 << (16 - nbits))) << nbits;
            ASSERT_EQ(format.toInteger(word), q) << nbits;
            ASSERT_EQ(format.toReal(word), q / 8.0) << nbits;
        }
    }
}

TEST(NumberFormatConversion, RoundsBitsBelowTheFormatDown) {
    const TNumberFormat format(12, 3);
    EXPECT_EQ(format.toInteger(15), 0);
    EXPECT_EQ(format.toInteger(16), 1);
    EXPECT_EQ(format.toInteger(-1), -1);
    EXPECT_EQ(format.toInteger(-16), -1);
    EXPECT_EQ(format.toInteger(-17), -2);
    EXPECT_EQ(format.toReal(-1), -0.125);
}

TEST(NumberFormatConversion, KeepsWordsTo16Bits) {
    const TNumberFormat format(12, 3);
    EXPECT_EQ(format.toWord(2047), 32752);
    EXPECT_EQ(format.toWord(2048), -32768);
    EXPECT_EQ(format.toWord(-2049), 32752);
    EXPECT_EQ(format.toWord(4096), 0);
    EXPECT_EQ(format.toWord(INT32_MIN), 0);
    EXPECT_EQ(format.toWord(INT32_MAX), -16);
}

}  // namespace
}  // namespace quarzel::test
