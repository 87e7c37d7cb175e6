// SPDX-License-Identifier: MIT
// What people see of a sweep while it runs. Its points are made up, so that all numbers are known.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "sweeps/live_table.hpp"
#include "sweeps/sweep_log.hpp"
#include "sweeps/sweep_progress.hpp"

namespace quarzel::test {

namespace {

using namespace std::chrono_literals;
using tool::ProgressMeter;

const ProgressMeter::Clock::time_point start{};

/// Two points of two curves with 800 blocks or 10 block errors each.
sweep::Configuration fourPoints() {
    sweep::Configuration configuration;
    configuration.blockSizes = {40};
    configuration.units = {2, 4};
    configuration.ebN0 = {{0}, {1'000'000}};
    configuration.stopRule.maxBlocks = 800;
    configuration.stopRule.maxBlockErrors = 10;
    return configuration;
}

/// Do the next blocks, the first of which are in error by a bit each.
void simulate(sweep::Dispatcher& dispatcher, std::uint64_t errors) {
    const auto task = dispatcher.next();
    ASSERT_TRUE(task);
    sweep::ErrorList list;
    const std::uint32_t bit = 1;
    for (std::uint64_t i = 0; i < errors; ++i) {
        list.append(task->firstOctet * sweep::blocksPerOctet + i, &bit, 1);
    }
    dispatcher.complete(*task, list);
}

}  // namespace

TEST(SweepProgress, CountsWhatIsDone) {
    sweep::Dispatcher dispatcher(sweep::planOf(fourPoints()));
    ProgressMeter meter;
    EXPECT_EQ(meter.measure(dispatcher, start).text(), "0 of 4 points, 0 blocks, 0 block errors");
    simulate(dispatcher, 0);
    const tool::SweepProgress progress = meter.measure(dispatcher, start + 10s);
    EXPECT_EQ(progress.pointsDone, 1U) << "a task has room for the point";
    EXPECT_EQ(progress.blocks, 800U);
    EXPECT_EQ(progress.bitsPerSecond, 3200);
    EXPECT_EQ(progress.text(), "1 of 4 points, 800 blocks, 0 block errors, 0:00:30 left");
}

TEST(SweepProgress, ForetellsTheWholeSweepFromTheErrorsSoFar) {
    sweep::Configuration configuration = fourPoints();
    configuration.stopRule.maxBlocks = 1'000'000;
    sweep::Dispatcher dispatcher(sweep::planOf(configuration));
    ProgressMeter meter;
    meter.measure(dispatcher, start);
    simulate(dispatcher,
             5);  // of 10 in 816 blocks: half of a point, and each of the others is taken to be like it
    EXPECT_EQ(meter.measure(dispatcher, start + 10s).text(),
              "0 of 4 points, 816 blocks, 5 block errors, 0:01:10 left");
}

TEST(SweepProgress, MeasuresTheSpeedOfThisRunAlone) {
    sweep::Dispatcher dispatcher(sweep::planOf(fourPoints()));
    simulate(dispatcher, 0);
    ProgressMeter meter;
    meter.measure(dispatcher, start);
    simulate(dispatcher, 0);
    EXPECT_EQ(meter.measure(dispatcher, start + 60s).text(),
              "2 of 4 points, 1600 blocks, 0 block errors, 0:02:00 left");
}

TEST(SweepLog, HasALineForEachPointAndOneAMinute) {
    sweep::Dispatcher dispatcher(sweep::planOf(fourPoints()));
    std::ostringstream stream;
    tool::SweepLog log(stream, start);
    log.update(dispatcher, start);
    simulate(dispatcher, 0);
    log.update(dispatcher, start + 999ms);
    EXPECT_EQ(stream.str(), "") << "silent for a second";
    log.update(dispatcher, start + 1s);
    log.update(dispatcher, start + 59s);
    const std::string first =
        "quarzel: K 40, 2 units, algorithm 1, 6 iterations, llr 4, 0 dB: 800 blocks, 0 block errors, BLER "
        "0.00e+00\n";
    EXPECT_EQ(stream.str(), first);
    log.update(dispatcher, start + 60s);
    log.update(dispatcher, start + 119s);
    const std::string minute = "quarzel: 1 of 4 points, 800 blocks, 0 block errors, 0:03:00 left\n";
    EXPECT_EQ(stream.str(), first + minute);
    simulate(dispatcher, 10);
    EXPECT_FALSE(log.finish(dispatcher)) << "a log is no table";
    EXPECT_EQ(stream.str(), first + minute +
                                "quarzel: K 40, 2 units, algorithm 1, 6 iterations, llr 4, 1 dB: 10 blocks, "
                                "10 block errors, BLER "
                                "1.00e+00\n");
}

TEST(LiveTable, GrowsAndIsTheTableOfTheResultInTheEnd) {
    sweep::Dispatcher dispatcher(sweep::planOf(fourPoints()));
    std::ostringstream terminal;
    tool::LiveTable table(
        terminal, [] { return std::size_t{80}; }, start);
    table.update(dispatcher, start);
    simulate(dispatcher, 0);
    table.update(dispatcher, start + 999ms);
    EXPECT_EQ(terminal.str(), "") << "silent for a second";
    table.update(dispatcher, start + 10s);
    const std::string headings =
        "K 40, 2 units, algorithm 1, 6 iterations, llr 4\n"
        "  Eb/N0    blocks bit errors  block e.       BER      BLER  95 % of BLER\n";
    const std::string row = "      0       800          0         0  0.00e+00  0.00e+00  0.00e+00 4.78e-03\n";
    EXPECT_EQ(terminal.str(),
              "\x1b[J" + headings + row +
                  "K 40, 2 units, algorithm 1, 6 iterations, llr 4\x1b[K\n"
                  "1 of 4 points, 800 blocks, 0 block errors, 0:00:30 left, 0.0 Mbit/s\x1b[K\r"
                  "\x1b[A");
    terminal.str("");
    table.update(dispatcher, start + 10199ms);
    EXPECT_EQ(terminal.str(), "") << "five times a second at most";
    EXPECT_TRUE(table.finish(dispatcher));
    EXPECT_EQ(terminal.str(), "\x1b[J");
}

TEST(LiveTable, FitsATerminalWhoseWidthChanges) {
    sweep::Dispatcher dispatcher(sweep::planOf(fourPoints()));
    std::ostringstream terminal;
    std::size_t width = 30;
    tool::LiveTable table(
        terminal, [&width] { return width; }, start);
    table.update(dispatcher, start + 1s);
    EXPECT_EQ(terminal.str(),
              "K 40, 2 units, algorithm 1, 6\x1b[K\n0 of 4 points, 0 blocks, 0 bl\x1b[K\r\x1b[A");
    terminal.str("");
    width = 20;
    table.update(dispatcher, start + 2s);
    EXPECT_EQ(terminal.str(), "K 40, 2 units, algo\x1b[K\n0 of 4 points, 0 bl\x1b[K\r\x1b[A");
}

}  // namespace quarzel::test
