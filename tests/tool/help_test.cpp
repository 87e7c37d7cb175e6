// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <sstream>

#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// Compare a help with the one in golden/. With QUARZEL_RENEW_GOLDEN=1 in the environment the stored one is
/// renewed instead.
void expectHelp(const std::vector<std::string>& arguments, const std::string& name) {
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
    const std::string file = std::string(QUARZEL_GOLDEN) + '/' + name;
    const char* const renew = std::getenv("QUARZEL_RENEW_GOLDEN");
    if (renew != nullptr && std::string(renew) == "1") {
        ASSERT_TRUE(std::ofstream(file, std::ios::binary) << run.out << std::flush) << file;
        return;
    }
    EXPECT_EQ(run.out, readFile(file));
    std::istringstream lines(run.out);
    for (std::string line; std::getline(lines, line);) {
        EXPECT_LE(line.size(), 80U) << "too wide for a terminal: " << line;
    }
}

}  // namespace

TEST(Help, TeachesTheTool) {
    expectHelp({"--help"}, "help.txt");
}
TEST(Help, TeachesDecode) {
    expectHelp({"decode", "--help"}, "decode_help.txt");
}
TEST(Help, TeachesInfo) {
    expectHelp({"info", "--help"}, "info_help.txt");
}
TEST(Help, TeachesTraceDiff) {
    expectHelp({"trace-diff", "--help"}, "trace_diff_help.txt");
}
TEST(Help, TeachesCompare) {
    expectHelp({"compare", "--help"}, "compare_help.txt");
}

TEST(Help, HasAShortOption) {
    EXPECT_EQ(runTool({"decode", "-h"}).out, runTool({"decode", "--help"}).out);
}

TEST(Help, TellsTheVersionOfTheProject) {
    const ToolRun run = runTool({"--version"});
    EXPECT_EQ(run.out, "quarzel " QUARZEL_TOOL_VERSION "\n");
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

}  // namespace quarzel::test
