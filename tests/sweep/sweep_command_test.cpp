// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "sweep/result.hpp"
#include "sweeps.hpp"
#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

const std::vector<std::string> quickSweep = {
    "sweep", "--block-size",       "40", "--iterations", "3", "--ebn0",      "0,1.5,20", "--max-blocks",
    "301",   "--max-block-errors", "50", "--seed",       "7", "--algorithm", "0",        "--llr",
    "8"};

std::vector<std::string> quickSweepWith(const std::vector<std::string>& more) {
    std::vector<std::string> arguments = quickSweep;
    arguments.insert(arguments.end(), more.begin(), more.end());
    return arguments;
}

}  // namespace

TEST(SweepCommand, PrintsATable) {
    const ToolRun run = runTool(quickSweep);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.out, R"(K 40, 2 units, algorithm 0, 3 iterations
  Eb/N0    blocks bit errors  block e.       BER      BLER  95 % of BLER
      0        98        538        50  1.37e-01  5.10e-01  4.13e-01 6.07e-01
    1.5       301        269        35  2.23e-02  1.16e-01  8.48e-02 1.57e-01
     20       301          0         0  0.00e+00  0.00e+00  0.00e+00 1.26e-02
)");
}

TEST(SweepCommand, PrintsErrorsAfterEveryIteration) {
    const ToolRun run = runTool(quickSweepWith({"--per-iteration", "--ebn0", "1.5"}));
    EXPECT_EQ(run.exitCode, 2) << "an option given twice";
    const ToolRun csv =
        runTool({"sweep", "--block-size", "40", "--iterations", "3", "--ebn0", "1.5", "--max-blocks", "301",
                 "--llr", "8", "--seed", "7", "--algorithm", "0", "--per-iteration", "--csv"});
    EXPECT_EQ(
        csv.out,
        R"(block_size,units,algorithm,iterations,ebn0_db,iteration,blocks,bits,bit_errors,block_errors,ber,bler,ber_low,ber_high,bler_low,bler_high,stopped_by
40,2,0,3,1.5,1,301,12040,490,88,0.040697674418604654,0.292358803986711,,,,,blocks
40,2,0,3,1.5,2,301,12040,294,40,0.02441860465116279,0.132890365448505,,,,,blocks
40,2,0,3,1.5,3,301,12040,269,35,0.0223421926910299,0.11627906976744186,0.014152487874877733,0.03053189750718207,0.08480627225462417,0.15742278381391805,blocks
)");
}

TEST(SweepCommand, TakesEveryItemOfAListOnceAndInTheOrderGiven) {
    const ToolRun run = runTool({"sweep", "--block-size", "48,40,048", "--units", "8", "--units", "2,8",
                                 "--ebn0", "20", "--max-blocks", "1", "--csv"});
    const std::string rest = "[^\n]*\n";
    EXPECT_THAT(run.out, testing::MatchesRegex(rest + "48,8," + rest + "48,2," + rest + "40,8," + rest +
                                               "40,2," + rest));
}

TEST(SweepCommand, PrintsTheResultThatItWrites) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const ToolRun run = runTool(quickSweepWith({"--json", "-o", file}));
    EXPECT_EQ(run.out, readFile(file));
    EXPECT_EQ(sweep::readResult(run.out).points.size(), 3U);
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json"));
    const ToolRun again = runTool(quickSweepWith({"--json", "-o", file, "--resume"}));
    EXPECT_EQ(again.out, run.out) << "what is done is not done again";
}

TEST(SweepCommand, GoesInPartsThatMergeIntoTheSameFile) {
    const TemporaryDirectory directory;
    std::vector<std::string> merge = {"merge", "-o", directory.path("merged.json"), "--json"};
    for (const char* const number : {"1", "2", "3"}) {
        const std::string file = directory.path(number);
        const ToolRun run = runTool(quickSweepWith({"--shard", number + std::string("/3"), "-o", file}));
        EXPECT_THAT(run.out, testing::StartsWith(file + ": part " + number + " of 3, "));
        merge.push_back(file);
    }
    const std::string expected = runTool(quickSweepWith({"--json"})).out;
    EXPECT_EQ(runTool(merge).out, expected);
    EXPECT_EQ(readFile(directory.path("merged.json")), expected);
    merge.pop_back();
    EXPECT_EQ(runTool(merge).err,
              "quarzel: error: 1 of 3 shards are missing: 3/3; run them and give their files too\n");
}

// Twice in a row, as `timeout` and the shell of a cluster job do.
TEST(SweepCommand, KeepsWhatIsDoneWhenASignalComes) {
    for (const char* const signal : {"TERM", "INT"}) {
        const TemporaryDirectory directory;
        const ToolRun run = runTool(
            {"-c",
             R"("$0" sweep --ebn0 8,9 --max-blocks 1000000000 --block-size 40 -o "$1" --checkpoint-every 0 &
                until [ -e "$1.checkpoint" ]; do sleep 0.01; done
                kill -s "$2" $!
                kill -s "$2" $!
                wait $!)",
             QUARZEL_TOOL, directory.path("result.json"), signal},
            {.program = "/bin/sh"});
        EXPECT_EQ(run.exitCode, 4);
        EXPECT_EQ(run.err,
                  "quarzel: error: interrupted when 0 of 2 points were done; go on with the same command and "
                  "--resume\n");
        EXPECT_EQ(run.out, "");
        EXPECT_THAT(directory.names(), testing::ElementsAre("result.json.checkpoint"));
    }
}

TEST(SweepCommand, TellsOfAFullDiskAndGoesOn) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const ToolRun full = runTool(quickSweepWith({"-o", file}), {.fileSizeLimit = 300});
    EXPECT_THAT(full.err, testing::HasSubstr("quarzel: warning: the checkpoint could not be renewed: "));
    EXPECT_THAT(full.err,
                testing::HasSubstr("result.json: cannot be written: File too large; raise the limit"));
    EXPECT_EQ(full.exitCode, 3);
    EXPECT_TRUE(directory.names().empty()) << "nothing half-written";
    EXPECT_EQ(runTool(quickSweepWith({"-o", file, "--resume"})).exitCode, 0);
    EXPECT_EQ(readFile(file), runTool(quickSweepWith({"--json"})).out);
}

TEST(SweepCommand, ShowsATableThatLivesOnATerminal) {
    const ToolRun run = runTool({"sweep", "--ebn0", "3", "--max-block-errors", "0", "--block-size", "40",
                                 "--max-blocks", "100000000", "--max-time", "2"},
                                {.terminal = true});
    EXPECT_THAT(run.err, testing::HasSubstr("K 40, 2 units, algorithm 1, 6 iterations"));
    EXPECT_THAT(run.err, testing::HasSubstr("Mbit/s  elapsed     left"));
    EXPECT_THAT(run.err, testing::ContainsRegex("      3 .*[0-9]\\.[0-9]  0:00:0[12]  "));
    EXPECT_THAT(run.out, testing::StartsWith("K 40, 2 units, algorithm 1, 6 iterations\n"));
}

// The stored result comes from version 1.0.0.
TEST(VerifyResult, FindsTheResultOfAnotherVersionTheSameByteForByte) {
    const std::string file = QUARZEL_SWEEP_DATA "/small_sweep.json";
    const ToolRun run = runTool({"verify-result", file});
    EXPECT_EQ(run.out, file + ": the same byte for byte, 12 points with 2731 blocks\n");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(VerifyResult, FindsAResultThatComesOutOtherwise) {
    const TemporaryDirectory directory;
    sweep::Result result = resultOf(smallSweep());
    result.points[1].counts[0].bitErrors += 1;
    const std::string file = directory.write("result.json", sweep::resultText(result));
    const ToolRun run = runTool({"verify-result", file});
    EXPECT_THAT(run.out,
                testing::StartsWith(file + ": differs: K 40, 2 units, algorithm 0, 3 iterations, 1.5 dB: "));
    EXPECT_EQ(run.exitCode, 1);
}

TEST(VerifyResult, RepeatsPointsThatTimeHasEnded) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    runTool({"sweep", "--ebn0", "5", "--max-blocks", "1000000000", "--max-time", "1", "--block-size", "6144",
             "-o", file});
    EXPECT_THAT(readFile(file), testing::HasSubstr("\"stopped_by\": \"time\""));
    EXPECT_EQ(runTool({"verify-result", file}).exitCode, 0);
}

}  // namespace quarzel::test
