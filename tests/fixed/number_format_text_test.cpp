// SPDX-License-Identifier: MIT
// The property string of a number format, and its text on a stream.
#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <sstream>
#include <string>

#include "fixed/format_fields.hpp"
#include "fixed/number_format.hpp"
#include "support/capture.hpp"
#include "support/locale_guard.hpp"

namespace quarzel::test {
namespace {

const std::string widthLine = "ERROR:TNumberFormat:nbits must be in range [1:16]\n";
const std::string binaryPointLine = "ERROR:TNumberFormat:binpt must be in range [1:16] and <nbits\n";

std::string unexpectedLine(const std::string& properties) {
    return "ERROR:TNumberFormat:Unexpected property string:" + properties + "\n";
}

/// Create a format that must be made without a word.
std::unique_ptr<TNumberFormat> accepted(const std::string& properties) {
    std::unique_ptr<TNumberFormat> format;
    const Output output = capture([&] { format.reset(TNumberFormat::create(properties)); });
    EXPECT_EQ(output.out, "") << properties;
    EXPECT_EQ(output.err, "") << properties;
    EXPECT_NE(format, nullptr) << properties;
    return format;
}

/// What is written about a format that must be refused.
std::string refusal(const std::string& properties) {
    std::unique_ptr<TNumberFormat> format;
    const Output output = capture([&] { format.reset(TNumberFormat::create(properties)); });
    EXPECT_EQ(format, nullptr) << properties;
    EXPECT_EQ(output.out, "") << properties;
    return output.err;
}

std::string formatName(std::uint32_t nbits, std::uint32_t binpt) {
    return "Fix_" + std::to_string(nbits) + "_" + std::to_string(binpt);
}

TEST(NumberFormatText, IsRefusedForABadWidthFirstAndThenForABadBinaryPoint) {
    for (std::uint32_t nbits = 0; nbits <= 20; ++nbits) {
        for (std::uint32_t binpt = 0; binpt <= 20; ++binpt) {
            const std::string properties = formatName(nbits, binpt);
            if (nbits < 1 || nbits > 16) {
                EXPECT_EQ(refusal(properties), widthLine) << properties;
            } else if (binpt < 1 || binpt >= nbits) {
                EXPECT_EQ(refusal(properties), binaryPointLine) << properties;
            } else if (const auto format = accepted(properties)) {
                EXPECT_EQ(fields(*format), fields({nbits, binpt}));
            }
        }
    }
}

TEST(NumberFormatText, ComesBackFromEveryFormatThatWasCreated) {
    for (std::uint32_t nbits = 2; nbits <= 16; ++nbits) {
        for (std::uint32_t binpt = 1; binpt < nbits; ++binpt) {
            const auto format = accepted(formatName(nbits, binpt));
            ASSERT_NE(format, nullptr);
            EXPECT_EQ(format->getProperties(), formatName(nbits, binpt));
            const auto again = accepted(format->getProperties());
            ASSERT_NE(again, nullptr);
            EXPECT_EQ(fields(*again), fields(*format));
        }
    }
}

TEST(NumberFormatText, TellsWidthAndBinaryPointOfAnyFormat) {
    EXPECT_EQ(TNumberFormat(6, 2).getProperties(), "Fix_6_2");
    EXPECT_EQ(TNumberFormat(17, 0).getProperties(), "Fix_17_0");
    EXPECT_EQ(TNumberFormat(0xFFFFFFFF, 0xFFFFFFFF).getProperties(), "Fix_4294967295_4294967295");
}

TEST(NumberFormatText, IsReadAsADecimalStreamReadsNumbers) {
    for (const std::string properties : {"Fix_6_2", "Fix_6_2xyz", "Fix_6_2_9", "Fix_6_2.75", "Fix_ 6 _ 2",
                                         "Fix_\t6\n_\r\v2 ", "Fix_+6_+2", "Fix_06_002"}) {
        if (const auto format = accepted(properties)) {
            EXPECT_EQ(fields(*format), fields({6, 2})) << properties;
        }
    }
    if (const auto format = accepted("Fix_010_2")) {
        EXPECT_EQ(format->nbits, 10U);
    }
}

TEST(NumberFormatText, IsEchoedWhenItHasAnotherShape) {
    for (const std::string properties : {"fix_6_2",
                                         "FIX_6_2",
                                         "Fixed_6_2",
                                         "Fi_6_2",
                                         " Fix_6_2",
                                         "Fix _6_2",
                                         "Fix6_2",
                                         "Fix:6_2",
                                         "Fix",
                                         "Fix_",
                                         "Fix_6",
                                         "Fix_6_",
                                         "Fix_6_ ",
                                         "Fix_6-2",
                                         "Fix_6 2",
                                         "Fix_6__2",
                                         "Fix__6_2",
                                         "Fix_6_x2",
                                         "Fix_x6_2",
                                         "Fix_0x6_2",
                                         "Fix_6.0_2",
                                         "_6_2",
                                         "6_2",
                                         "_",
                                         "",
                                         "Fix_4294967296_2",
                                         "Fix_6_4294967296",
                                         "Fix_99999999999999999999_2",
                                         "fix_17_0"}) {
        EXPECT_EQ(refusal(properties), unexpectedLine(properties)) << properties;
    }
    // The largest numbers that are read as such.
    EXPECT_EQ(refusal("Fix_4294967295_2"), widthLine);
    EXPECT_EQ(refusal("Fix_6_4294967295"), binaryPointLine);
}

TEST(NumberFormatText, IsRefusedWithALineForNegativeNumbers) {
    for (const std::string properties :
         {"Fix_-6_2", "Fix_6_-2", "Fix_-6_-2", "Fix_-4294967290_2", "Fix_6_-4294967294"}) {
        const std::string line = refusal(properties);
        EXPECT_TRUE(line == widthLine || line == binaryPointLine || line == unexpectedLine(properties))
            << line;
    }
}

TEST(NumberFormatText, DoesNotDependOnTheGlobalLocale) {
    const GroupingLocale grouping;
    EXPECT_EQ(refusal("Fix_1,2_3"), unexpectedLine("Fix_1,2_3"));
    EXPECT_EQ(TNumberFormat(12, 11).getProperties(), "Fix_12_11");
}

TEST(NumberFormatStream, ShowsEveryFieldOnOneLine) {
    std::ostringstream stream;
    stream << TNumberFormat(6, 2);
    EXPECT_EQ(stream.str(),
              "NBITS=6 BINPT=2 Shift=10 Scale=4 Min=-32768 Max=31744 MinQ=-32 MaxQ=31 Mask=-1024");
    stream.str("");
    stream << TNumberFormat(16, 4) << '|' << TNumberFormat(0, 3);
    EXPECT_EQ(stream.str(),
              "NBITS=16 BINPT=4 Shift=0 Scale=16 Min=-32768 Max=32767 MinQ=-32768 MaxQ=32767 Mask=-1|"
              "NBITS=0 BINPT=3 Shift=16 Scale=8 Min=0 Max=0 MinQ=-2147483648 MaxQ=2147483647 Mask=0");
}

TEST(NumberFormatStream, FollowsTheNumberFormattingOfTheStream) {
    std::ostringstream stream;
    stream << std::hex << TNumberFormat(6, 2);
    EXPECT_EQ(stream.str(),
              "NBITS=6 BINPT=2 Shift=a Scale=4 Min=8000 Max=7c00 MinQ=ffffffe0 MaxQ=1f Mask=fc00");
    stream.str("");
    stream << std::showbase << std::uppercase << TNumberFormat(8, 3);
    EXPECT_EQ(stream.str(),
              "NBITS=0X8 BINPT=0X3 Shift=0X8 Scale=0X8 Min=0X8000 Max=0X7F00 MinQ=0XFFFFFF80 MaxQ=0X7F "
              "Mask=0XFF00");
    stream.str("");
    stream << std::oct << std::noshowbase << TNumberFormat(16, 15);
    EXPECT_EQ(stream.str(),
              "NBITS=20 BINPT=17 Shift=0 Scale=100000 Min=100000 Max=77777 MinQ=37777700000 MaxQ=77777 "
              "Mask=177777");
    stream.str("");
    stream << std::dec << std::showpos << TNumberFormat(12, 3);
    EXPECT_EQ(stream.str(),
              "NBITS=12 BINPT=3 Shift=4 Scale=8 Min=-32768 Max=+32752 MinQ=-2048 MaxQ=+2047 Mask=-16");
}

}  // namespace
}  // namespace quarzel::test
