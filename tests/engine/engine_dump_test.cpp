// SPDX-License-Identifier: MIT
#include "engine/engine_dump.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <iomanip>
#include <locale>
#include <sstream>
#include <string>
#include <vector>

#include "support/locale_guard.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

const std::string gammaHeader =
    "n    intrinsic   parity0     parity1        g1[0]        g1[1]        g1[2]        g1[3]          g2[0] "
    "  "
    "     g2[1]        g2[2]        g2[3]\n";

const std::string alphaBetaHeader =
    "n    g4          g5          g6          g7             ab1[0]       ab1[1]       ab1[2]       ab1[3]   "
    "  "
    "  ab1[4]       ab1[5]       ab1[6]       ab1[7]         ab2[0]       ab2[1]       ab2[2]       ab2[3]   "
    "  "
    "  ab2[4]       ab2[5]       ab2[6]       ab2[7]\n";

const std::string extrinsicHeader =
    "n    a[0]        a[1]        a[2]        a[3]        a[4]        a[5]        a[6]        a[7]          "
    "b[0"
    "]        b[1]        b[2]        b[3]        b[4]        b[5]        b[6]        b[7]          g[4]     "
    "  "
    " g[5]        g[6]        g[7]           e1           e2\n";

/// Words in units of 1/128, of which the format below keeps steps of 1/8.
const TNumberFormat stateFormat(12, 3);

/// The working arrays of an engine, everything zero at first.
struct Arrays {
    explicit Arrays(std::size_t n)
        : alpha(n),
          beta(n),
          gamma(n),
          gamma2(n),
          intrinsic(n),
          parity0(n),
          parity1(n),
          extrinsic(n),
          extrinsic2(n) {}

    std::vector<T8> alpha;
    std::vector<T8> beta;  ///< also the second array of a pair with alpha
    std::vector<T8> gamma;
    std::vector<T8> gamma2;
    std::vector<short> intrinsic;
    std::vector<short> parity0;
    std::vector<short> parity1;
    std::vector<short> extrinsic;
    std::vector<short> extrinsic2;
};

Arrays randomArrays(std::mt19937& random, std::size_t n) {
    Arrays arrays(n);
    arrays.alpha = randomRecords(random, n);
    arrays.beta = randomRecords(random, n);
    arrays.gamma = randomRecords(random, n);
    arrays.gamma2 = randomRecords(random, n);
    arrays.intrinsic = randomWords(random, n);
    arrays.parity0 = randomWords(random, n);
    arrays.parity1 = randomWords(random, n);
    arrays.extrinsic = randomWords(random, n);
    arrays.extrinsic2 = randomWords(random, n);
    return arrays;
}

/// One of the three tables, in a form common to all.
using Table = std::ostream& (*)(std::ostream&, const Arrays&, const TNumberFormat&);

std::ostream& gammaTable(std::ostream& stream, const Arrays& arrays, const TNumberFormat& format) {
    return dumpGamma(stream, static_cast<unsigned>(arrays.gamma.size()), arrays.intrinsic.data(),
                     arrays.parity0.data(), arrays.parity1.data(), arrays.gamma.data(), arrays.gamma2.data(),
                     &format);
}

std::ostream& alphaBetaTable(std::ostream& stream, const Arrays& arrays, const TNumberFormat& format) {
    return dumpAlphaBeta(stream, static_cast<unsigned>(arrays.gamma.size()), arrays.gamma.data(),
                         arrays.alpha.data(), arrays.beta.data(), &format);
}

std::ostream& extrinsicTable(std::ostream& stream, const Arrays& arrays, const TNumberFormat& format) {
    return dumpExtrinsic(stream, static_cast<unsigned>(arrays.gamma.size()), arrays.alpha.data(),
                         arrays.beta.data(), arrays.gamma.data(), arrays.extrinsic.data(),
                         arrays.extrinsic2.data(), &format);
}

constexpr Table tables[] = {gammaTable, alphaBetaTable, extrinsicTable};

std::string text(Table table, const Arrays& arrays, const TNumberFormat& format = stateFormat) {
    std::ostringstream stream;
    EXPECT_EQ(&table(stream, arrays, format), &stream);
    return stream.str();
}

std::vector<std::string> lines(const std::string& text) {
    std::vector<std::string> result;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        result.push_back(line);
    }
    return result;
}

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

/// Where a column's values begin: below its heading.
std::size_t column(const std::string& header, const std::string& heading) {
    const std::size_t position = header.find(heading);
    EXPECT_NE(position, std::string::npos) << heading;
    return position;
}

/// The positions of the markers in the only row of a table.
std::vector<std::size_t> markers(Table table, const Arrays& arrays) {
    const std::string row = lines(text(table, arrays))[1];
    std::vector<std::size_t> positions;
    for (std::size_t i = 0; i < row.size(); ++i) {
        if (row[i] == '*') {
            positions.push_back(i);
        }
    }
    return positions;
}

std::string heading(const char* name, std::size_t element) {
    return std::string(name) + "[" + std::to_string(element) + "]";
}

using Positions = std::vector<std::size_t>;

TEST(EngineDump, MarksAPairOfBranchMetricsThatDiffer) {
    for (std::size_t i = 0; i < 4; ++i) {
        Arrays arrays(1);
        arrays.gamma[0][i] = 16;
        EXPECT_EQ(markers(gammaTable, arrays), (Positions{column(gammaHeader, heading("g1", i)) - 1,
                                                          column(gammaHeader, heading("g2", i)) - 1}));
    }
}

TEST(EngineDump, MarksAPairOfStateMetricsThatDiffer) {
    for (std::size_t i = 0; i < 8; ++i) {
        Arrays arrays(1);
        arrays.beta[0][i] = 16;
        EXPECT_EQ(markers(alphaBetaTable, arrays),
                  (Positions{column(alphaBetaHeader, heading("ab1", i)) - 1,
                             column(alphaBetaHeader, heading("ab2", i)) - 1}));
    }
}

TEST(EngineDump, MarksAPairOfExtrinsicValuesThatDiffer) {
    Arrays arrays(1);
    arrays.extrinsic2[0] = 16;
    EXPECT_EQ(markers(extrinsicTable, arrays),
              (Positions{column(extrinsicHeader, "e1") - 1, column(extrinsicHeader, "e2") + 1}));
}

TEST(EngineDump, MarksWordsThatDifferInBitsThatAreNotPrinted) {
    Arrays arrays(1);
    arrays.gamma[0][0] = 1;
    EXPECT_EQ(markers(gammaTable, arrays),
              (Positions{column(gammaHeader, "g1[0]") - 1, column(gammaHeader, "g2[0]") - 1}));
}

TEST(EngineDump, MarksNothingInEqualArrays) {
    std::mt19937 random = seededRandom();
    Arrays arrays = randomArrays(random, 50);
    arrays.gamma2 = arrays.gamma;
    arrays.beta = arrays.alpha;
    arrays.extrinsic2 = arrays.extrinsic;
    for (const Table table : tables) {
        EXPECT_EQ(text(table, arrays).find('*'), std::string::npos);
    }
}

TEST(EngineDump, MarksNothingButThePairs) {
    std::mt19937 random = seededRandom();
    Arrays arrays = randomArrays(random, 50);
    arrays.extrinsic2 = arrays.extrinsic;
    EXPECT_EQ(text(extrinsicTable, arrays).find('*'), std::string::npos);

    for (std::size_t k = 0; k < 50; ++k) {
        std::copy_n(arrays.gamma[k].element, 4, arrays.gamma2[k].element);
    }
    EXPECT_EQ(text(gammaTable, arrays).find('*'), std::string::npos);
}

/// Whether every heading of a table has a value of its only row below it, `shift` places to the right.
void expectAligned(Table table, const std::string& header, const std::vector<std::string>& headings,
                   std::size_t shift = 0) {
    const std::string row = lines(text(table, Arrays(1)))[1];
    for (const std::string& name : headings) {
        EXPECT_EQ(row.substr(column(header, name) + shift, 12), "+0.000000   ") << name;
    }
}

TEST(EngineDump, PutsValuesBelowTheirHeadings) {
    std::vector<std::string> gammaHeadings = {"intrinsic", "parity0", "parity1"};
    std::vector<std::string> alphaBetaHeadings = {"g4", "g5", "g6", "g7"};
    std::vector<std::string> extrinsicHeadings = {"g[4]", "g[5]", "g[6]", "g[7]", "e1"};
    for (std::size_t i = 0; i < 8; ++i) {
        if (i < 4) {
            gammaHeadings.insert(gammaHeadings.end(), {heading("g1", i), heading("g2", i)});
        }
        alphaBetaHeadings.insert(alphaBetaHeadings.end(), {heading("ab1", i), heading("ab2", i)});
        extrinsicHeadings.insert(extrinsicHeadings.end(), {heading("a", i), heading("b", i)});
    }
    expectAligned(gammaTable, gammaHeader, gammaHeadings);
    expectAligned(alphaBetaTable, alphaBetaHeader, alphaBetaHeadings);
    expectAligned(extrinsicTable, extrinsicHeader, extrinsicHeadings);
}

TEST(EngineDump, PutsTheLastExtrinsicValueTwoPlacesRightOfItsHeading) {
    expectAligned(extrinsicTable, extrinsicHeader, {"e2"}, 2);
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
