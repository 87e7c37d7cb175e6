// SPDX-License-Identifier: MIT
// The stored blocks find every fault of the catalogue that any block can find.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
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

/// The stored blocks of a core.
std::vector<CoveringBlock> storedBlocks(int units, int type) {
    std::ifstream file(QUARZEL_COVERING_BLOCKS);
    std::string line;
    std::getline(file, line);
    EXPECT_EQ(line, coveringColumns);
    std::vector<CoveringBlock> blocks;
    while (std::getline(file, line)) {
        std::istringstream cells(line);
        std::string cell;
        const auto next = [&]() -> const std::string& {
            std::getline(cells, cell, ',');
            return cell;
        };
        const auto number = [&] { return std::atoi(next().c_str()); };
        const bool wanted = std::pair{number(), number()} == std::pair(units, type);
        CoveringBlock block;
        block.K = number();
        block.iterations = number();
        const auto name = std::find(tool::stimulusNames.begin(), tool::stimulusNames.end(), next());
        block.stimulus = static_cast<tool::Stimulus>(name - tool::stimulusNames.begin());
        block.decibels = number();
        block.number = static_cast<unsigned>(number());
        block.tag = static_cast<unsigned>(number());
        EXPECT_EQ(rowOf(block, units, type) == line, wanted) << line;
        if (wanted) {
            blocks.push_back(block);
        }
    }
    return blocks;
}

class CoveringBlocks : public testing::TestWithParam<std::pair<int, int>> {};

TEST_P(CoveringBlocks, FindEveryFaultThatIsNotEquivalent) {
    const auto [units, type] = GetParam();
    if (!exhaustive() && units != 2) {
        GTEST_SKIP() << "QUARZEL_TEST_EXHAUSTIVE is not set";
    }
    FaultFinder finder(units, type);
    std::vector<Subject> subjects = finder.subjectsOf(catalogue());
    const std::vector<CoveringBlock> blocks = storedBlocks(units, type);
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        finder.tryOn(blocks[i], i, subjects, 1);
    }
    for (const Subject& subject : subjects) {
        EXPECT_EQ(subject.finders.empty(), isEquivalent(subject.fault, type)) << subject.fault.name;
    }
}

INSTANTIATE_TEST_SUITE_P(Cores, CoveringBlocks,
                         testing::Values(std::pair(2, 0), std::pair(2, 1), std::pair(2, 2), std::pair(4, 0),
                                         std::pair(4, 1), std::pair(4, 2), std::pair(8, 0), std::pair(8, 1),
                                         std::pair(8, 2)),
                         [](const auto& info) {
                             return std::to_string(info.param.first) + "UnitsType" +
                                    std::to_string(info.param.second);
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
