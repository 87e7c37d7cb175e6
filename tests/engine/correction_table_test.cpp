// SPDX-License-Identifier: MIT
// The max-star correction tables.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <nlohmann/json.hpp>
#include <string>
#include <utility>
#include <vector>

#include "engine/probe_engine.hpp"
#include "engine/tables.hpp"
#include "support/capture.hpp"
#include "support/vectors.hpp"

namespace quarzel::test {
namespace {

const std::string pointsLine =
    "ERROR:TCalculationEngineModBase::createLUT:Number of points must be a binary number\n";
const std::string binaryPointLine =
    "ERROR:TCalculationEngineModBase::createLUT:Binary point of state metrics is incompatible with 8 bit "
    "lookup tables\n";

/// A table and what was written while it was made.
struct Made {
    Table table;
    Output output;
};

Made make(unsigned points, const TNumberFormat& format) {
    Made made;
    made.output = capture([&] { made.table = TCalculationEngineModBase::createLUT(points, &format); });
    return made;
}

/// A table that must be made without a word.
Table accepted(unsigned points, const TNumberFormat& format) {
    Made made = make(points, format);
    EXPECT_EQ(made.output.out + made.output.err, "") << points;
    EXPECT_EQ(made.table.size(), tableSize) << points;
    made.table.resize(tableSize);
    return std::move(made.table);
}

/// What is written about a table that must be refused.
std::string refusal(unsigned points, const TNumberFormat& format) {
    const Made made = make(points, format);
    EXPECT_THAT(made.table, testing::IsEmpty()) << points;
    EXPECT_EQ(made.output.out, "") << points;
    return made.output.err;
}

int entry(const Table& table, int difference) {
    return table[static_cast<std::size_t>(difference + 32768)];
}

TEST(CorrectionTable, EntriesStayWithinTheLimitsOfTheFormat) {
    TNumberFormat format(12, 3);
    EXPECT_EQ(entry(accepted(16, format), 0), 6 << 4);
    format.maxQ = 2;
    format.max = 2 << 4;
    EXPECT_EQ(entry(accepted(16, format), 0), 2 << 4);
    EXPECT_EQ(entry(accepted(16, format), 20 << 4), 1 << 4);
    format.minQ = 1;
    format.min = 3 << 4;
    EXPECT_EQ(entry(accepted(16, format), 32767), 3 << 4);
    EXPECT_EQ(entry(accepted(16, format), 20 << 4), 1 << 4);
}

TEST(CorrectionTable, EqualsTheStoredTables) {
    const auto cases = readCases("correction_tables.jsonl");
    ASSERT_EQ(cases.size(), 50U);
    for (const auto& stored : cases) {
        const auto properties = stored.at("state_format").get<std::string>();
        const auto points = stored.at("points").get<unsigned>();
        SCOPED_TRACE(properties + ", " + std::to_string(points) + " points");
        const std::unique_ptr<TNumberFormat> format(TNumberFormat::create(properties));
        ASSERT_NE(format, nullptr);
        Table expected;
        for (const auto& run : stored.at("runs")) {
            expected.insert(expected.end(), run.at(1).get<std::size_t>(), run.at(0).get<unsigned char>());
        }
        const Made made = make(points, *format);
        EXPECT_TRUE(made.table == expected);
        EXPECT_EQ(made.output.out, "");
        EXPECT_EQ(made.output.err, stored.at("stderr").get<std::string>());
    }
}

/// Entries of a table that falls in steps: up to each difference the entry that goes with it, then zero.
struct Step {
    int upTo;
    int value;
};

void expectSteps(const Table& table, const std::vector<Step>& steps) {
    for (int difference = -32768; difference <= 32767; ++difference) {
        const int d = difference < 0 ? -1 - difference : difference;
        int expected = 0;
        for (auto step = steps.rbegin(); step != steps.rend(); ++step) {
            if (d <= step->upTo) {
                expected = step->value;
            }
        }
        ASSERT_EQ(entry(table, difference), expected) << difference;
    }
}

TEST(CorrectionTable, OfTheCoreFallsInSixSteps) {
    expectSteps(accepted(16, {12, 3}), {{63, 96}, {127, 64}, {191, 48}, {255, 32}, {383, 16}});
}

TEST(CorrectionTable, OfTenBitsAnd16PointsIsTheWorkedOne) {
    const Table table = accepted(16, {10, 2});
    expectSteps(table, {{127, 192}, {255, 128}, {639, 64}});
    EXPECT_EQ(entry(table, -32768), 0);
    EXPECT_EQ(entry(table, 32767), 0);
}

TEST(CorrectionTable, ChangesAtWholeUnitsOnlyForUpToEightPoints) {
    // 1.0 is 128 in this format; the corrections of 0, 1 and 2 are 6, 3 and 1 eighths.
    expectSteps(accepted(1, {12, 3}), {{127, 96}});
    expectSteps(accepted(2, {12, 3}), {{127, 96}, {255, 48}});
    expectSteps(accepted(4, {12, 3}), {{127, 96}, {255, 48}, {383, 16}});
    expectSteps(accepted(8, {12, 3}), {{127, 96}, {255, 48}, {383, 16}});
}

TEST(CorrectionTable, EndsAtADifferenceOfAsManyUnitsAsItHasPoints) {
    // 1.0 is 256 in this format. Eight points show the corrections that four points cut off.
    expectSteps(accepted(4, {16, 8}), {{255, 177}, {511, 80}, {767, 32}, {1023, 12}});
    expectSteps(accepted(8, {16, 8}),
                {{255, 177}, {511, 80}, {767, 32}, {1023, 12}, {1279, 5}, {1535, 2}, {1791, 1}});
}

TEST(CorrectionTable, HasFullResolutionForZeroPointsAndForMoreThanItCanUse) {
    for (const TNumberFormat& format : {TNumberFormat(12, 3), TNumberFormat(16, 8), TNumberFormat(9, 1)}) {
        const Table full = accepted(65536, format);
        for (const unsigned points : {0U, 131072U, 1U << 20, 1U << 31}) {
            EXPECT_TRUE(accepted(points, format) == full) << points;
        }
    }
}

TEST(CorrectionTable, OfFullResolutionIsTheRoundedCorrectionAtEveryDifference) {
    const TNumberFormat format(16, 8);
    const Table table = accepted(0, format);
    for (int difference = 0; difference <= 32767; ++difference) {
        const double correction = std::log1p(std::exp(-difference / 256.0));
        ASSERT_NEAR(entry(table, difference), 256 * correction, 0.5000001) << difference;
    }
}

TEST(CorrectionTable, SharesAnEntryBetweenADifferenceAndItsComplementInEveryFormat) {
    for (std::uint32_t nbits = 9; nbits <= 16; ++nbits) {
        for (std::uint32_t binpt = 1; binpt + 8 <= nbits; ++binpt) {
            const TNumberFormat format(nbits, binpt);
            for (const unsigned points : {0U, 4U, 16U, 64U}) {
                const Table table = accepted(points, format);
                SCOPED_TRACE(format.getProperties() + ", " + std::to_string(points) + " points");
                const int largest = static_cast<int>(std::lround(std::log(2.0) * format.scale));
                EXPECT_EQ(entry(table, 0), largest << format.shift);
                EXPECT_EQ(entry(table, -1), entry(table, 0));
                EXPECT_EQ(entry(table, -32768), entry(table, 32767));
                for (int d = 1; d <= 32767; ++d) {
                    ASSERT_EQ(entry(table, -1 - d), entry(table, d)) << d;
                    ASSERT_LE(entry(table, d), entry(table, d - 1)) << d;
                    ASSERT_EQ(entry(table, d) % (1 << format.shift), 0) << d;
                }
            }
        }
    }
}

TEST(CorrectionTable, RefusesPointsThatAreNoPowerOfTwo) {
    for (const unsigned points :
         {3U, 5U, 12U, 15U, 17U, 65535U, 65537U, 0x7FFFFFFFU, 0x80000001U, 0xFFFFFFFFU}) {
        EXPECT_EQ(refusal(points, {12, 3}), pointsLine) << points;
    }
}

TEST(CorrectionTable, RefusesAFormatWhoseCorrectionsExceedAByteWhateverThePoints) {
    for (const unsigned points : {0U, 1U, 12U, 16U, 65536U}) {
        EXPECT_EQ(refusal(points, {12, 5}), binaryPointLine) << points;
        EXPECT_EQ(refusal(points, {8, 3}), binaryPointLine) << points;
        EXPECT_EQ(refusal(points, {16, 9}), binaryPointLine) << points;
        EXPECT_EQ(refusal(points, {2, 1}), binaryPointLine) << points;
    }
}

TEST(CorrectionTable, TakesAFormatWhoseCorrectionsJustFitAByte) {
    EXPECT_EQ(entry(accepted(16, {12, 4}), 0), 176);
    EXPECT_EQ(entry(accepted(16, {16, 8}), 0), 177);
    EXPECT_EQ(entry(accepted(16, {9, 1}), 0), 128);
}

}  // namespace
}  // namespace quarzel::test
