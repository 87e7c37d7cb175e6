// SPDX-License-Identifier: MIT
#include "decode/progress.hpp"

#include <gtest/gtest.h>

#include <sstream>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

using tool::Progress;
using namespace std::chrono_literals;

const Progress::Clock::time_point start{};

/// Decode four blocks, each of which takes the stand-in 0.4 s.
ToolRun decodeSlowly(bool terminal) {
    const TemporaryDirectory directory;
    xt::xarray<std::int8_t> soft = xt::ones<std::int8_t>({4, 3, 44});
    xt::dump_npy(directory.path("slow.npy"), soft);
    return runTool({"decode", directory.path("slow.npy"), "--json", "--threads", "1"},
                   {.program = QUARZEL_TOOL_ON_STAND_IN, .terminal = terminal});
}

}  // namespace

TEST(Progress, StaysSilentForASecond) {
    std::ostringstream terminal;
    {
        Progress progress(terminal, true, 10, start);
        progress.update(9, start + 999ms);
    }
    EXPECT_EQ(terminal.str(), "");
}

TEST(Progress, DrawsABarAndWipesItAtTheEnd) {
    std::ostringstream terminal;
    {
        Progress progress(terminal, true, 12, start);
        progress.update(4, start + 1s);
        EXPECT_EQ(terminal.str(), "[##########....................]  33 %  4 of 12 blocks\x1b[K\r");
        terminal.str("");
    }
    EXPECT_EQ(terminal.str(), "\x1b[K");
}

TEST(Progress, DrawsTheFirstAndTheLastBlock) {
    std::ostringstream terminal;
    Progress progress(terminal, true, 1000, start);
    progress.update(1, start + 1s);
    progress.update(1000, start + 2s);
    EXPECT_EQ(terminal.str(),
              "[..............................]   0 %  1 of 1000 blocks\x1b[K\r"
              "[##############################] 100 %  1000 of 1000 blocks\x1b[K\r");
}

TEST(Progress, DrawsTenTimesASecondAtMost) {
    std::ostringstream terminal;
    Progress progress(terminal, true, 10, start);
    progress.update(1, start + 1000ms);
    progress.update(2, start + 1099ms);
    progress.update(3, start + 1100ms);
    EXPECT_EQ(terminal.str(),
              "[###...........................]  10 %  1 of 10 blocks\x1b[K\r"
              "[#########.....................]  30 %  3 of 10 blocks\x1b[K\r");
}

TEST(Progress, IsALineAMinuteElsewhere) {
    std::ostringstream log;
    {
        Progress progress(log, false, 1000, start);
        progress.update(1, start + 59s);
        EXPECT_EQ(log.str(), "");
        progress.update(10, start + 60s);
        progress.update(11, start + 119s);
        progress.update(400, start + 121s);
    }
    EXPECT_EQ(log.str(),
              "quarzel: 10 of 1000 blocks, 1:39:00 left\n"
              "quarzel: 400 of 1000 blocks, 0:03:01 left\n");
}

TEST(Progress, ForetellsNothingBeforeTheFirstBlock) {
    std::ostringstream log;
    Progress(log, false, 1000, start).update(0, start + 60s);
    EXPECT_EQ(log.str(), "quarzel: 0 of 1000 blocks\n");
}

TEST(Progress, IsShownOnATerminal) {
    const ToolRun run = decodeSlowly(true);
    EXPECT_EQ(run.exitCode, 0);
    EXPECT_NE(run.err.find("[######################........]  75 %  3 of 4 blocks\x1b[K\r"),
              std::string::npos)
        << run.err;
    EXPECT_TRUE(run.err.ends_with("\x1b[K")) << run.err;
    EXPECT_TRUE(run.out.starts_with("{\"capture\":")) << run.out;
}

TEST(Progress, IsNotShownInAFileBeforeAMinute) {
    const ToolRun run = decodeSlowly(false);
    EXPECT_EQ(run.exitCode, 0);
    EXPECT_EQ(run.err, "");
}

}  // namespace quarzel::test
