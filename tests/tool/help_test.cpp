// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <sstream>

#include "golden.hpp"
#include "run_tool.hpp"

namespace quarzel::test {

namespace {

/// Compare a help with the one in golden/.
void expectHelp(const std::vector<std::string>& arguments, const std::string& name) {
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
    expectGolden(run.out, name);
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
TEST(Help, TeachesCoverage) {
    expectHelp({"coverage", "--help"}, "coverage_help.txt");
}
TEST(Help, TeachesVectors) {
    expectHelp({"vectors", "--help"}, "vectors_help.txt");
}
TEST(Help, TeachesPlot) {
    expectHelp({"plot", "--help"}, "plot_help.txt");
}
TEST(Help, TeachesManual) {
    expectHelp({"manual", "--help"}, "manual_help.txt");
}
TEST(Help, TeachesCompletion) {
    expectHelp({"completion", "--help"}, "completion_help.txt");
}

TEST(Help, TeachesHelp) {
    expectHelp({"help", "--help"}, "help_help.txt");
}
TEST(Help, TeachesRebuild) {
    expectHelp({"rebuild", "--help"}, "rebuild_help.txt");
}
TEST(Help, TeachesSweep) {
    expectHelp({"sweep", "--help"}, "sweep_help.txt");
}
TEST(Help, TeachesThreshold) {
    expectHelp({"threshold", "--help"}, "threshold_help.txt");
}
TEST(Help, TeachesShow) {
    expectHelp({"show", "--help"}, "show_help.txt");
}
TEST(Help, TeachesMerge) {
    expectHelp({"merge", "--help"}, "merge_help.txt");
}
TEST(Help, TeachesVerifyResult) {
    expectHelp({"verify-result", "--help"}, "verify_result_help.txt");
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
