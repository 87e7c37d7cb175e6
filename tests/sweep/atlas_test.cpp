// SPDX-License-Identifier: MIT
// The stored atlas: Eb/N0 at which 10 % and 1 % of blocks fail.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// Check that what the tool finds now is what a table has.
void expectAgain(const std::string& file, const std::vector<std::string>& options) {
    std::vector<std::string> arguments = {"threshold",     "--iterations", "4,6,8",
                                          "--target-bler", "0.1,0.01",     "--csv"};
    arguments.insert(arguments.end(), options.begin(), options.end());
    const std::string found = runTool(arguments).out;
    const std::string rows = found.substr(found.find('\n'));
    EXPECT_EQ(std::count(rows.begin(), rows.end(), '\n'), 7);
    EXPECT_THAT(readFile(file), testing::HasSubstr(rows));
}

}  // namespace

TEST(Atlas, ComesOutAgainByteForByte) {
    expectAgain(QUARZEL_ATLAS "/thresholds.csv", {"--block-size", "104", "--algorithm", "0"});
}

}  // namespace quarzel::test
