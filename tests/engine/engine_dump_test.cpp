// SPDX-License-Identifier: MIT
// The text of the tables, to the last blank.
#include <gtest/gtest.h>

#include <cstdint>
#include <iomanip>
#include <locale>
#include <sstream>
#include <string>
#include <vector>

#include "engine/dump_tables.hpp"
#include "support/locale_guard.hpp"

namespace quarzel::test {
namespace {

TEST(EngineDump, WritesTheInputsAndBothArraysOfBranchMetrics) {
    Arrays arrays(2);
    arrays.intrinsic = {16, -16};
    arrays.parity0 = {32, -1024};
    arrays.parity1 = {0, 2032};
    arrays.gamma = {{{8, 16, 24, 32, 1, 2, 3, 4}}, {{-16, -32, -48, -64}}};
    arrays.gamma2 = {{{8, 16, 24, 32, 5, 6, 7, 8}}, {{-16, -33, -48, 64}}};
    EXPECT_EQ(text(gammaTable, arrays), gammaHeader +
                                            "0    +0.125000   +0.250000   +0.000000     "
                                            " +0.000000    +0.125000    +0.125000    +0.250000     "
                                            " +0.000000    +0.125000    +0.125000    +0.250000   \n"
                                            "1    -0.125000   -8.000000   +15.875000    "
                                            " -0.125000   *-0.250000    -0.375000   *-0.500000     "
                                            " -0.125000   *-0.375000    -0.375000   *+0.500000   \n");
}

TEST(EngineDump, WritesBranchMetricsAndBothArraysOfStateMetrics) {
    Arrays arrays(1);
    arrays.gamma = {{{16, 32, 48, 64}}};
    arrays.alpha = {{{0, -16384, 16, 32, 48, 64, 80, 96}}};
    arrays.beta = {{{0, -16384, 16, 32, 48, 64, 80, -32768}}};
    EXPECT_EQ(text(alphaBetaTable, arrays), alphaBetaHeader +
                                                "0    +0.375000   +0.250000   +0.500000   +0.125000     "
                                                " +0.000000    -128.000000  +0.125000    +0.250000   "
                                                " +0.375000    +0.500000    +0.625000   *+0.750000     "
                                                " +0.000000    -128.000000  +0.125000    +0.250000   "
                                                " +0.375000    +0.500000    +0.625000   *-256.000000 \n");
}

TEST(EngineDump, WritesAllMetricsAndBothArraysOfExtrinsicValues) {
    Arrays arrays(2);
    arrays.alpha = {{{0, -16, -32, -48, -64, -80, -96, -112}}, {}};
    arrays.beta = {{{128, 144, 160, 176, 192, 208, 224, 240}}, {}};
    arrays.gamma = {{{16, 32, 48, 64}}, {}};
    arrays.extrinsic = {800, -800};
    arrays.extrinsic2 = {816, -800};
    EXPECT_EQ(text(extrinsicTable, arrays), extrinsicHeader +
                                                "0    +0.000000   -0.125000   -0.250000   -0.375000   "
                                                "-0.500000   -0.625000   -0.750000   -0.875000     "
                                                "+1.000000   +1.125000   +1.250000   +1.375000   "
                                                "+1.500000   +1.625000   +1.750000   +1.875000     "
                                                "+0.375000   +0.250000   +0.500000   +0.125000     "
                                                "*+6.250000     *+6.375000   \n"
                                                "1    +0.000000   +0.000000   +0.000000   +0.000000   "
                                                "+0.000000   +0.000000   +0.000000   +0.000000     "
                                                "+0.000000   +0.000000   +0.000000   +0.000000   "
                                                "+0.000000   +0.000000   +0.000000   +0.000000     "
                                                "+0.000000   +0.000000   +0.000000   +0.000000     "
                                                " -6.250000      -6.250000   \n");
}

TEST(EngineDump, WritesHeadingsAloneForNoSteps) {
    const Arrays none(0);
    EXPECT_EQ(text(gammaTable, none), gammaHeader);
    EXPECT_EQ(text(alphaBetaTable, none), alphaBetaHeader);
    EXPECT_EQ(text(extrinsicTable, none), extrinsicHeader);
}

TEST(EngineDump, ShiftsArithmeticallyBeforeItDivides) {
    Arrays arrays(1);
    arrays.intrinsic = {-1};
    arrays.parity0 = {63};
    arrays.parity1 = {-65};
    EXPECT_EQ(lines(text(gammaTable, arrays, TNumberFormat(10, 2)))[1].substr(0, 41),
              "0    -0.250000   +0.000000   -0.500000   ");
}

TEST(EngineDump, WritesTheExtremesOfAWord) {
    Arrays arrays(1);
    arrays.intrinsic = {INT16_MIN};
    arrays.parity0 = {INT16_MAX};
    arrays.parity1 = {-1};
    const auto values = [&arrays](std::uint32_t nbits, std::uint32_t binpt) {
        return lines(text(gammaTable, arrays, TNumberFormat(nbits, binpt)))[1].substr(0, 41);
    };
    EXPECT_EQ(values(12, 3), "0    -256.000000 +255.875000 -0.125000   ");
    EXPECT_EQ(values(16, 15), "0    -1.000000   +0.999969   -0.000031   ");
    EXPECT_EQ(values(2, 1), "0    -1.000000   +0.500000   -0.500000   ");
}

TEST(EngineDump, LetsAValueOfMoreThan12CharactersPushItsRow) {
    Arrays arrays(1);
    arrays.intrinsic = {INT16_MIN};
    arrays.parity0 = {INT16_MAX};
    EXPECT_EQ(lines(text(gammaTable, arrays, TNumberFormat(16, 1)))[1].substr(0, 43),
              "0    -16384.000000+16383.500000+0.000000   ");
}

TEST(EngineDump, WritesStepNumbersOfAnyLength) {
    const std::vector<std::string> rows = lines(text(gammaTable, Arrays(100001)));
    ASSERT_EQ(rows.size(), 100002U);
    EXPECT_EQ(rows[10].substr(0, 14), "9    +0.000000");
    EXPECT_EQ(rows[11].substr(0, 14), "10   +0.000000");
    EXPECT_EQ(rows[10000].substr(0, 14), "9999 +0.000000");
    EXPECT_EQ(rows[10001].substr(0, 14), "10000+0.000000");
    EXPECT_EQ(rows[100001].substr(0, 15), "100000+0.000000");
}

TEST(EngineDump, NeitherFollowsNorChangesTheSettingsOfTheStream) {
    std::mt19937 random = seededRandom();
    const Arrays arrays = randomArrays(random, 1100);
    for (const Table table : tables) {
        const std::string plain = text(table, arrays);
        const GroupingLocale grouping;
        std::ostringstream stream;
        ASSERT_EQ(stream.getloc(), std::locale());
        stream << std::hex << std::showbase << std::uppercase << std::scientific << std::right;
        stream.fill('#');
        stream.width(20);
        stream.precision(2);
        const auto flags = stream.flags();
        table(stream, arrays, stateFormat);
        EXPECT_EQ(stream.str(), plain);
        EXPECT_EQ(stream.flags(), flags);
        EXPECT_EQ(stream.fill(), '#');
        EXPECT_EQ(stream.width(), 20);
        EXPECT_EQ(stream.precision(), 2);
        EXPECT_EQ(stream.getloc(), std::locale());
    }
}

TEST(EngineDump, WritesNothingToAStreamThatHasFailed) {
    for (const Table table : tables) {
        std::ostringstream stream;
        stream.setstate(std::ios::failbit);
        EXPECT_EQ(&table(stream, Arrays(3), stateFormat), &stream);
        EXPECT_EQ(stream.str(), "");
    }
}

/// A value as a formatting stream writes it.
std::string streamed(std::int16_t word, const TNumberFormat& format) {
    std::ostringstream stream;
    stream << std::fixed << std::showpos << std::left << std::setw(12)
           << static_cast<double>(word >> format.shift) / format.scale;
    return stream.str();
}

TEST(EngineDump, WritesValuesAsAFormattingStreamDoes) {
    std::mt19937 random = seededRandom();
    for (std::uint32_t nbits = 2; nbits <= 16; ++nbits) {
        for (std::uint32_t binpt = 1; binpt < nbits; ++binpt) {
            const TNumberFormat format(nbits, binpt);
            const Arrays arrays = randomArrays(random, 20);
            const std::vector<std::string> rows = lines(text(gammaTable, arrays, format));
            for (std::size_t k = 0; k < 20; ++k) {
                const std::string expected = streamed(arrays.intrinsic[k], format) +
                                             streamed(arrays.parity0[k], format) +
                                             streamed(arrays.parity1[k], format);
                EXPECT_EQ(rows[k + 1].substr(5, expected.size()), expected);
            }
        }
    }
}

}  // namespace
}  // namespace quarzel::test
