// SPDX-License-Identifier: MIT
// Where values stand in the tables, and which of them are marked.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <string>
#include <vector>

#include "engine/dump_tables.hpp"

namespace quarzel::test {
namespace {

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

}  // namespace
}  // namespace quarzel::test
