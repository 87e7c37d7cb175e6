// SPDX-License-Identifier: MIT
// The parameter table against the stored one and the rule of the block sizes.
#include "interleaver/lte_params.hpp"

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "interleaver/lte_block_sizes.hpp"

namespace quarzel::test {
namespace {

/// The table as text, a row a line, as the stored file has it.
std::string tableText() {
    std::ostringstream text;
    text << "K,f1,f2\n";
    for (const LteParams& row : lteParams) {
        text << row.K << ',' << row.f1 << ',' << row.f2 << '\n';
    }
    return text.str();
}

TEST(LteParams, EqualTheStoredTable) {
    std::ifstream file(std::string(QUARZEL_TEST_DATA) + "/qpp_table.csv");
    ASSERT_TRUE(file);
    std::ostringstream stored;
    stored << file.rdbuf();
    EXPECT_EQ(tableText(), stored.str());
}

TEST(LteParams, HaveARowForEveryBlockSizeInAscendingOrder) {
    std::vector<std::uint32_t> sizes;
    for (const LteParams& row : lteParams) {
        sizes.push_back(row.K);
    }
    EXPECT_EQ(sizes.size(), 188U);
    EXPECT_EQ(sizes, lteBlockSizes());
}

TEST(LteParams, HaveAnOddLinearAndAnEvenQuadraticCoefficientWithinTheBlock) {
    for (const LteParams& row : lteParams) {
        EXPECT_TRUE(row.f1 % 2 == 1 && row.f2 % 2 == 0 && row.f1 < row.K && row.f2 < row.K) << row.K;
    }
}

}  // namespace
}  // namespace quarzel::test
