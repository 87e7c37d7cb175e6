// SPDX-License-Identifier: MIT
// The covering blocks find every fault of the catalogue that any block can find.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "lanes/lane_setup.hpp"
#include "oracle/fault_finder.hpp"
#include "oracle/plain_qpp_rows.hpp"

namespace quarzel::test {
namespace {

using namespace oracle;

/// A table of the tool without the rows of other cores.
std::string rowsOf(const std::string& file, int units, int type) {
    std::ifstream table(file);
    std::string row;
    std::string rows;
    std::getline(table, row);
    const std::string core = std::to_string(units) + ',' + std::to_string(type) + ',';
    while (std::getline(table, row)) {
        rows += row.compare(0, core.size(), core) == 0 ? row + '\n' : "";
    }
    return rows;
}

class CoveringBlocks : public testing::TestWithParam<std::pair<int, int>> {};

TEST_P(CoveringBlocks, AreThoseOfTheTable) {
    const auto [units, type] = GetParam();
    std::string rows;
    for (const tool::CoveringBlock& block : tool::coveringBlocks(units, type)) {
        rows += rowOf(block, units, type) + '\n';
    }
    EXPECT_NE(rows, "");
    EXPECT_EQ(rows, rowsOf(QUARZEL_COVERING_BLOCKS, units, type));
}

TEST_P(CoveringBlocks, FindWhatTheirScoreSays) {
    const auto [units, type] = GetParam();
    if (!exhaustive() && units != 2) {
        GTEST_SKIP() << "QUARZEL_TEST_EXHAUSTIVE is not set";
    }
    const FaultFinder finder(units, type);
    const std::vector<tool::CoveringBlock> blocks = tool::coveringBlocks(units, type);
    std::vector<Subject> subjects = finder.subjectsOf(catalogue());
    finder.runSet(blocks, subjects);
    const tool::CoveringScore score = tool::coveringScore(units, type);
    for (const Subject& subject : subjects) {
        EXPECT_EQ(subject.finders.empty(), isEquivalent(subject.fault, type)) << subject.fault.name;
    }
    EXPECT_EQ(score.found, score.of);
    EXPECT_EQ(score.of + score.equivalent, subjects.size());
    std::vector<Subject> heldOut = finder.subjectsOf(heldOutFaults());
    finder.runSet(blocks, heldOut);
    const auto found = std::count_if(heldOut.begin(), heldOut.end(),
                                     [](const Subject& subject) { return !subject.finders.empty(); });
    EXPECT_EQ(score.heldOutFound, found);
    EXPECT_EQ(score.heldOutOf, heldOut.size());
}

/// The page has a line for each core.
TEST_P(CoveringBlocks, HaveTheirScoreInThePage) {
    const auto [units, type] = GetParam();
    const tool::CoveringScore score = tool::coveringScore(units, type);
    std::uint32_t bits = 0;
    const std::vector<tool::CoveringBlock> blocks = tool::coveringBlocks(units, type);
    for (const tool::CoveringBlock& block : blocks) {
        bits += block.planned.blockSize;
    }
    std::ostringstream line;
    line << "\n| " << units << " | " << type << " | " << blocks.size() << " | " << bits << " | "
         << score.found << " of " << score.of << " | " << score.equivalent << " | " << score.heldOutFound
         << " of " << score.heldOutOf << " |\n";
    std::ifstream page(QUARZEL_VECTORS_PAGE);
    const std::string text(std::istreambuf_iterator<char>(page), {});
    EXPECT_NE(text.find(line.str()), std::string::npos) << line.str();
}

INSTANTIATE_TEST_SUITE_P(Cores, CoveringBlocks,
                         testing::Values(std::pair(2, 0), std::pair(2, 1), std::pair(2, 2), std::pair(4, 0),
                                         std::pair(4, 1), std::pair(4, 2), std::pair(8, 0), std::pair(8, 1),
                                         std::pair(8, 2)),
                         [](const auto& test) {
                             return std::to_string(test.param.first) + "UnitsType" +
                                    std::to_string(test.param.second);
                         });

/// Why the odd step of a halved rest goes nowhere.
TEST(Segments, HaveAnEvenNumberOfSteps) {
    for (const QppRow& row : qppRows) {
        for (int units = 2; units <= 8; units *= 2) {
            int segments = 1;
            while (segments < 4 * units && 128 * segments <= row.K) {
                segments *= 2;
            }
            EXPECT_EQ(row.K % (2 * segments), 0) << row.K;
        }
    }
}

}  // namespace
}  // namespace quarzel::test
