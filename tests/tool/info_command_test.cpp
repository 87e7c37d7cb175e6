// SPDX-License-Identifier: MIT
#include "decode/info_command.hpp"

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <CLI/CLI.hpp>

#include <algorithm>
#include <nlohmann/json.hpp>
#include <numeric>
#include <sstream>

#include "quarzel/code.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

/// What `info K --json` tells.
nlohmann::json infoOf(std::uint32_t K) {
    CLI::App app;
    std::ostringstream out;
    tool::addInfoCommand(app, out);
    app.parse("info --json " + std::to_string(K));
    return nlohmann::json::parse(out.str());
}

}  // namespace

TEST(InfoCommand, ListsTheBlockSizesAsRanges) {
    const ToolRun run = runTool({"info"});
    EXPECT_EQ(run.out,
              "188 block sizes, in information bits:\n"
              "   40 to  512 in steps of  8\n"
              "  528 to 1024 in steps of 16\n"
              " 1056 to 2048 in steps of 32\n"
              " 2112 to 6144 in steps of 64\n");
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(InfoCommand, ListsEveryBlockSizeInJson) {
    std::vector<std::uint32_t> sizes;
    for (std::uint32_t K = 40; K <= 6144; K += K < 512 ? 8 : K < 1024 ? 16 : K < 2048 ? 32 : 64) {
        sizes.push_back(K);
    }
    ASSERT_EQ(sizes.size(), 188U);
    const ToolRun run = runTool({"info", "--json"});
    const nlohmann::json expected = {{"block_sizes", sizes}};
    EXPECT_EQ(run.out, expected.dump() + '\n');
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(InfoCommand, TellsHowTheCoreCutsTheLargestBlock) {
    const ToolRun run = runTool({"info", "6144"});
    EXPECT_THAT(run.out, StartsWith("block size   6144 information bits\n"
                                    "interleaver  pi(i) = (263 i + 480 i^2) mod 6144, f1 = 263, f2 = 480\n"
                                    "\n"
                                    "units  threads  segments  steps per segment  windows per segment\n"
                                    "    2        8         8                768  12 (12 x 64)\n"
                                    "    4       16        16                384  6 (6 x 64)\n"
                                    "    8       32        32                192  3 (3 x 64)\n"));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(InfoCommand, TellsHowTheCoreCutsTheSmallestBlock) {
    EXPECT_THAT(runTool({"info", "40"}).out,
                StartsWith("block size   40 information bits\n"
                           "interleaver  pi(i) = (3 i + 10 i^2) mod 40, f1 = 3, f2 = 10\n"
                           "\n"
                           "units  threads  segments  steps per segment  windows per segment\n"
                           "    2        8         1                 40  1 (40)\n"
                           "    4       16         1                 40  1 (40)\n"
                           "    8       32         1                 40  1 (40)\n"));
}

TEST(InfoCommand, TellsTheUnequalWindowsAtTheEndOfASegment) {
    EXPECT_THAT(runTool({"info", "2368"}).out,
                StartsWith("block size   2368 information bits\n"
                           "interleaver  pi(i) = (367 i + 444 i^2) mod 2368, f1 = 367, f2 = 444\n"
                           "\n"
                           "units  threads  segments  steps per segment  windows per segment\n"
                           "    2        8         8                296  5 (3 x 64 + 2 x 52)\n"
                           "    4       16        16                148  3 (64 + 2 x 42)\n"
                           "    8       32        32                 74  2 (2 x 37)\n"));
}

TEST(InfoCommand, TellsTheSameInJson) {
    const ToolRun run = runTool({"info", "2368", "--json"});
    EXPECT_THAT(run.out, StartsWith("{\"block_size\":2368,\"f1\":367,\"f2\":444,\"cores\":["
                                    "{\"units\":2,\"threads\":8,\"segments\":8,\"steps_per_segment\":296,"
                                    "\"window_lengths\":[64,64,64,52,52]},"
                                    "{\"units\":4,\"threads\":16,\"segments\":16,\"steps_per_segment\":148,"
                                    "\"window_lengths\":[64,42,42]},"
                                    "{\"units\":8,\"threads\":32,\"segments\":32,\"steps_per_segment\":74,"
                                    "\"window_lengths\":[37,37]}],\"thresholds\":["));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(InfoCommand, TellsWhereBlocksFail) {
    EXPECT_THAT(runTool({"info", "104"}).out,
                EndsWith("2 (2 x 52)\n"
                         "\n"
                         "4 iterations, type 0: 10 % of blocks fail at 1.43 dB, 1 % at 2.17 dB\n"
                         "6 iterations, type 0: 10 % of blocks fail at 1.30 dB, 1 % at 2.02 dB\n"
                         "8 iterations, type 0: 10 % of blocks fail at 1.23 dB, 1 % at 1.94 dB\n"
                         "4 iterations, type 1: 10 % of blocks fail at 1.22 dB, 1 % at 1.95 dB\n"
                         "6 iterations, type 1: 10 % of blocks fail at 1.09 dB, 1 % at 1.83 dB\n"
                         "8 iterations, type 1: 10 % of blocks fail at 1.03 dB, 1 % at 1.77 dB\n"
                         "4 iterations, type 2: 10 % of blocks fail at 1.12 dB, 1 % at 1.90 dB\n"
                         "6 iterations, type 2: 10 % of blocks fail at 1.02 dB, 1 % at 1.79 dB\n"
                         "8 iterations, type 2: 10 % of blocks fail at 0.98 dB, 1 % at 1.73 dB\n"));
    EXPECT_THAT(runTool({"info", "104", "--json"}).out,
                HasSubstr("],\"thresholds\":[{\"units\":2,\"algorithm\":0,\"iterations\":4,\"bler\":0.1,"
                          "\"ebn0_db\":1.434,\"ebn0_interval\":[1.419,1.449]},{"));
}

TEST(InfoCommand, TellsTheWholeAtlas) {
    std::string told =
        "block_size,units,algorithm,iterations,quantiser,scale,bler,ebn0_db,ebn0_low,ebn0_high\n";
    for (const BlockSize& size : blockSizes()) {
        const nlohmann::json info = infoOf(size.K);
        for (const auto& row : info.at("thresholds")) {
            told +=
                fmt::format("{},{},{},{},llr,4,{},{:.3f},{:.3f},{:.3f}\n", size.K, row["units"].get<int>(),
                            row["algorithm"].get<int>(), row["iterations"].get<int>(),
                            row["bler"].get<double>(), row["ebn0_db"].get<double>(),
                            row["ebn0_interval"][0].get<double>(), row["ebn0_interval"][1].get<double>());
        }
    }
    EXPECT_TRUE(told == readFile(QUARZEL_ATLAS "/thresholds.csv")) << "not the stored table";
}

TEST(InfoCommand, CoversEveryBlockWithSegmentsAndEverySegmentWithWindows) {
    for (const BlockSize& size : blockSizes()) {
        const std::uint32_t K = size.K;
        const nlohmann::json told = infoOf(K);
        ASSERT_EQ(told.at("cores").size(), 3U);
        for (const auto& core : told.at("cores")) {
            const std::uint32_t segments = core.at("segments");
            const std::uint32_t steps = core.at("steps_per_segment");
            const std::vector<std::uint32_t> windows = core.at("window_lengths");
            EXPECT_EQ(segments * steps, K);
            EXPECT_LE(segments, core.at("threads").get<std::uint32_t>());
            EXPECT_EQ(std::accumulate(windows.begin(), windows.end(), 0U), steps) << K;
            EXPECT_LE(*std::max_element(windows.begin(), windows.end()), 64U) << K;
        }
    }
}

}  // namespace quarzel::test
