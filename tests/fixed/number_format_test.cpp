// SPDX-License-Identifier: MIT
// The constants that a number format derives from its width and binary point.
#include "fixed/number_format.hpp"

#include <gtest/gtest.h>

#include <cstdint>
#include <type_traits>

#include "fixed/format_fields.hpp"

namespace quarzel::test {
namespace {

TEST(NumberFormat, IsAPlainValue) {
    EXPECT_FALSE(std::is_polymorphic_v<TNumberFormat>);
    EXPECT_TRUE(std::is_trivially_copyable_v<TNumberFormat>);
}

TEST(NumberFormat, DerivesTheWorkedConstants) {
    //                                   nbits binpt shift scale    min    max    minQ   maxQ   mask
    EXPECT_EQ(fields({2, 1}), FormatFields(2, 1, 14, 2, -32768, 16384, -2, 1, -16384));
    EXPECT_EQ(fields({6, 2}), FormatFields(6, 2, 10, 4, -32768, 31744, -32, 31, -1024));
    EXPECT_EQ(fields({8, 3}), FormatFields(8, 3, 8, 8, -32768, 32512, -128, 127, -256));
    EXPECT_EQ(fields({12, 3}), FormatFields(12, 3, 4, 8, -32768, 32752, -2048, 2047, -16));
    EXPECT_EQ(fields({16, 4}), FormatFields(16, 4, 0, 16, -32768, 32767, -32768, 32767, -1));
    EXPECT_EQ(fields({16, 15}), FormatFields(16, 15, 0, 32768, -32768, 32767, -32768, 32767, -1));
}

TEST(NumberFormat, PutsEveryWidthInTheTopBitsOfAWord) {
    for (std::uint32_t nbits = 1; nbits <= 16; ++nbits) {
        const TNumberFormat format(nbits, 1);
        const auto topBits = static_cast<std::int16_t>(0xFFFF0000U >> nbits);
        EXPECT_EQ(format.shift, 16 - nbits);
        EXPECT_EQ(format.mask, topBits) << nbits;
        EXPECT_EQ(format.min, -32768) << nbits;
        EXPECT_EQ(format.max, 32767 & topBits) << nbits;
        EXPECT_EQ(format.minQ * (1 << format.shift), format.min) << nbits;
        EXPECT_EQ(format.maxQ * (1 << format.shift), format.max) << nbits;
    }
}

TEST(NumberFormat, WeighsTheIntegerUnitByTheBinaryPoint) {
    std::uint32_t scale = 1;
    for (std::uint32_t binpt = 0; binpt <= 16; ++binpt, scale *= 2) {
        EXPECT_EQ(TNumberFormat(16, binpt).scale, scale);
    }
}

TEST(NumberFormat, TakesShiftCountsModulo32WhenConstructedWithAnyWidth) {
    EXPECT_EQ(fields({1, 0}), FormatFields(1, 0, 15, 1, -32768, 0, -1, 0, -32768));
    EXPECT_EQ(fields({0, 3}), FormatFields(0, 3, 16, 8, 0, 0, INT32_MIN, INT32_MAX, 0));
    EXPECT_EQ(fields({17, 3}), FormatFields(17, 3, 0xFFFFFFFF, 8, 0, 0, -65536, 65535, 0));
    EXPECT_EQ(fields({32, 3}), FormatFields(32, 3, 0xFFFFFFF0, 8, 0, 0, INT32_MIN, INT32_MAX, 0));
    EXPECT_EQ(fields({33, 3}), FormatFields(33, 3, 0xFFFFFFEF, 8, -32768, 0, -1, 0, -32768));
    EXPECT_EQ(TNumberFormat(12, 31).scale, 0x80000000U);
    EXPECT_EQ(TNumberFormat(12, 32).scale, 1U);
    EXPECT_EQ(TNumberFormat(12, 0xFFFFFFFF).scale, 0x80000000U);
}

}  // namespace
}  // namespace quarzel::test
