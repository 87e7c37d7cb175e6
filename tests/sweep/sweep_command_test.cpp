// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "sweep/result.hpp"
#include "sweeps.hpp"
#include "sweeps/sweep_table.hpp"
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
    EXPECT_EQ(run.out, R"(K 40, 2 units, algorithm 0, 3 iterations, llr 8
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
        R"(block_size,units,algorithm,iterations,quantiser,scale,ebn0_db,iteration,blocks,bits,bit_errors,block_errors,ber,bler,ber_low,ber_high,bler_low,bler_high,stopped_by
40,2,0,3,llr,8,1.5,1,301,12040,490,88,0.040697674418604654,0.292358803986711,,,,,blocks
40,2,0,3,llr,8,1.5,2,301,12040,294,40,0.02441860465116279,0.132890365448505,,,,,blocks
40,2,0,3,llr,8,1.5,3,301,12040,269,35,0.0223421926910299,0.11627906976744186,0.015517073234359923,0.032169312260367164,0.08480627225462417,0.15742278381391805,blocks
)");
}

TEST(SweepCommand, TakesEveryItemOfAListOnceAndSortsThem) {
    const ToolRun run = runTool({"sweep", "--block-size", "48,40,048", "--units", "8", "--units", "2,8",
                                 "--ebn0", "20", "--max-blocks", "1", "--csv"});
    const std::string rest = "[^\n]*\n";
    EXPECT_THAT(run.out, testing::MatchesRegex(rest + "40,2," + rest + "40,8," + rest + "48,2," + rest +
                                               "48,8," + rest));
}

TEST(SweepCommand, TakesQuantisersAsADimension) {
    const ToolRun run = runTool({"sweep", "--block-size", "40", "--ebn0", "20", "--max-blocks", "1", "--llr",
                                 "4,0.5", "--scale", "16", "--llr", "2"});
    const std::string row = R"(  Eb/N0    blocks bit errors  block e.       BER      BLER  95 % of BLER
     20         1          0         0  0.00e+00  0.00e+00  0.00e+00 7.93e-01
)";
    const std::string core = "K 40, 2 units, algorithm 1, 6 iterations, ";
    EXPECT_EQ(run.out, core + "scale 16\n" + row + core + "llr 0.5\n" + row + core + "llr 2\n" + row + core +
                           "llr 4\n" + row);
}

TEST(SweepCommand, PrintsTheResultThatItWrites) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const ToolRun run = runTool(quickSweepWith({"--json", "-o", file}));
    EXPECT_EQ(run.out, readFile(file));
    EXPECT_EQ(sweep::readResult(run.out).points.size(), 3U);
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json"));
    for (const std::vector<std::string>& more :
         {std::vector<std::string>{"--json", "-o", file, "--resume"}, {"--json", "-o", file}}) {
        EXPECT_EQ(runTool(quickSweepWith(more)).out, run.out) << "what is done is not done again";
    }
}

// In five steps: other sizes, other Eb/N0, more blocks or errors, iterations, quantisers. The last one takes
// in what the first ones have made.
TEST(SweepCommand, ExtendsAResultThatIsThere) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const auto sweepWith = [](std::vector<std::string> arguments, const std::vector<std::string>& more) {
        arguments.insert(arguments.begin(), {"sweep", "--algorithm", "0", "--seed", "7"});
        arguments.insert(arguments.end(), more.begin(), more.end());
        return runTool(arguments);
    };
    const std::vector<std::string> whole = {
        "--block-size", "40,48", "--iterations",       "2,3", "--ebn0", "0,1,2", "--llr", "2,4",
        "--max-blocks", "301",   "--max-block-errors", "50"};
    const std::vector<std::vector<std::string>> steps = {
        {"--block-size", "40", "--iterations", "2", "--ebn0", "1", "--max-blocks", "101"},
        {"--block-size", "48", "--iterations", "2", "--ebn0", "1", "--max-blocks", "3"},
        {"--block-size", "40", "--iterations", "2", "--ebn0", "0,1", "--max-block-errors", "3"},
        {"--block-size", "40", "--iterations", "3", "--ebn0", "2", "--max-blocks", "300"},
        {"--block-size", "40", "--iterations", "2", "--ebn0", "2", "--llr", "2", "--max-blocks", "8"},
        whole};
    for (const std::vector<std::string>& step : steps) {
        EXPECT_EQ(sweepWith(step, {"-o", file}).exitCode, 0);
    }
    const ToolRun expected = sweepWith(whole, {"--json"});
    EXPECT_EQ(readFile(file), expected.out);
    const ToolRun fewer = sweepWith(steps[0], {"-o", file, "--json"});
    EXPECT_EQ(fewer.out, expected.out) << "nothing is lost";
    EXPECT_EQ(readFile(file), expected.out);
}

TEST(SweepCommand, EndsCurvesBelowATarget) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const ToolRun run = runTool(quickSweepWith({"--target-bler", "0.2", "-o", file, "--json"}));
    EXPECT_THAT(run.out, testing::HasSubstr("\"ebn0_db\": 1.5,"));
    EXPECT_THAT(run.out, testing::Not(testing::HasSubstr("\"ebn0_db\": 20.0,")));
    EXPECT_EQ(runTool(quickSweepWith({"--target-bler", "0.2", "-o", file, "--json"})).out, run.out);
    EXPECT_EQ(runTool(quickSweepWith({"-o", file, "--json"})).out, runTool(quickSweepWith({"--json"})).out);
}

TEST(SweepCommand, RefusesToExtendAResultOfAnotherKind) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const std::string text = runTool(quickSweepWith({"-o", file, "--json"})).out;
    const auto complaintTo = [&](const std::vector<std::string>& arguments) {
        const ToolRun run = runTool(arguments);
        EXPECT_EQ(run.exitCode, 3);
        EXPECT_EQ(readFile(file), text);
        return run.err;
    };
    const std::string start = "quarzel: error: " + file;
    EXPECT_EQ(complaintTo({"sweep", "--ebn0", "9", "-o", file}),
              start + ": has seed 7, not 1; give --seed 7 or another name\n");
    EXPECT_EQ(
        complaintTo(quickSweepWith({"-o", file, "--per-iteration"})),
        start +
            ": has no counts after every iteration at K 40, 2 units, algorithm 0, 3 iterations, llr 8, 0 "
            "dB; leave out --per-iteration or give another name\n");
    EXPECT_EQ(
        complaintTo(quickSweepWith({"-o", file, "--shard", "1/2"})),
        start + ": is not of this part of this sweep; give the same options as before, or another name\n");
}

TEST(SweepCommand, GoesOnCountingAfterEveryIteration) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const std::string expected = runTool(quickSweepWith({"--json", "--per-iteration"})).out;
    runTool({"sweep", "--block-size", "40", "--iterations", "3", "--ebn0", "0", "--max-blocks", "5", "--seed",
             "7", "--algorithm", "0", "--llr", "8", "--per-iteration", "-o", file});
    EXPECT_EQ(runTool(quickSweepWith({"--per-iteration", "-o", file})).exitCode, 0);
    EXPECT_EQ(runTool(quickSweepWith({"-o", file, "--json"})).out, expected);
}

// The file comes from version 1.0.0 and has version 1 of the format.
TEST(SweepCommand, ExtendsAResultOfAnOlderVersion) {
    const TemporaryDirectory directory;
    const std::string old = readFile(QUARZEL_SWEEP_DATA "/small_sweep.json");
    const std::string file = directory.write("result.json", old);
    const std::vector<std::string> same = {"sweep", "--block-size", "40", "--algorithm",  "0", "--iterations",
                                           "3",     "--ebn0",       "0",  "--llr",        "8", "--seed",
                                           "7",     "-o",           file, "--max-blocks", "98"};
    EXPECT_EQ(runTool(same).exitCode, 0);
    EXPECT_EQ(readFile(file), old) << "there is nothing to do";
    std::vector<std::string> more = same;
    more.back() = "99";
    EXPECT_EQ(runTool(more).exitCode, 0);
    const sweep::Result extended = sweep::readResult(readFile(file));
    EXPECT_EQ(extended.points.size(), 12U);
    EXPECT_EQ(extended.points.begin()->second.blocks, 99U);
    EXPECT_EQ(extended.quarzel, VARDEL_IP_QUARZEL_VERSION);
}

TEST(ShowCommand, PrintsAStoredResult) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    for (const std::vector<std::string>& form : {std::vector<std::string>{}, {"--csv"}, {"--json"}}) {
        std::vector<std::string> show = {"show", file};
        show.insert(show.end(), form.begin(), form.end());
        std::vector<std::string> options = {"-o", file};
        options.insert(options.end(), form.begin(), form.end());
        const std::string printed = runTool(quickSweepWith(options)).out;
        EXPECT_EQ(runTool(show).out, printed);
    }
    EXPECT_THAT(runTool({"show", QUARZEL_SWEEP_DATA "/every_core.json"}).out, testing::HasSubstr(", scale "));
}

TEST(ShowCommand, RefusesWhatIsNoResult) {
    const TemporaryDirectory directory;
    const std::string part = directory.path("part");
    runTool(quickSweepWith({"--shard", "1/2", "-o", part}));
    EXPECT_EQ(
        runTool({"show", part}).err,
        "quarzel: error: " + part + ": is a part of a sweep; join all its parts with 'quarzel merge'\n");
    const ToolRun run = runTool({"show", directory.path("missing")});
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_THAT(run.err, testing::StartsWith("quarzel: error: " + directory.path("missing") + ": "));
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
    EXPECT_EQ(runTool(merge).err, "quarzel: error: 1 of 3 shards of the sweep of " + directory.path("1") +
                                      " are missing: 3/3; run them and give their files too\n");
}

// Twice in a row, as `timeout` and the shell of a cluster job do.
TEST(SweepCommand, KeepsWhatIsDoneWhenASignalComes) {
    for (const char* const signal : {"TERM", "INT", "HUP"}) {
        const TemporaryDirectory directory;
        const ToolRun run = runTool(
            {"-c",
             R"(env --default-signal=INT "$0" sweep --ebn0 8,9 --max-blocks 1e9 --block-size 40 -o "$1" --checkpoint-every 0 &
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

// A point of each takes a second.
const std::vector<std::string> watchedSweep = {"sweep", "--ebn0",       "3,4", "--max-block-errors",
                                               "0",     "--block-size", "40",  "--max-blocks",
                                               "1e9",   "--max-time",   "1"};

TEST(SweepCommand, ShowsATableThatLivesOnATerminal) {
    const ToolRun run = runTool(watchedSweep, {.terminal = true});
    EXPECT_THAT(run.err, testing::ContainsRegex("\n[01] of 2 points, [0-9]+ blocks, [0-9]+ block errors, "
                                                "0:00:0[0-2] left, [0-9.]+ Mbit/s\x1b"));
    EXPECT_THAT(run.out, testing::StartsWith("K 40, 2 units, algorithm 1, 6 iterations, llr 4\n"));
    std::istringstream lines(run.err);
    for (std::string line; std::getline(lines, line);) {
        EXPECT_LE(line.substr(0, line.find('\x1b')).size(), 80U) << line;
    }
}

TEST(SweepCommand, PrintsItsTableOnceOnATerminal) {
    const ToolRun run = runTool(watchedSweep, {.terminal = true, .outputToTerminal = true});
    EXPECT_EQ(run.exitCode, 0);
    // In the end all that changed is wiped, and the rest of the table follows.
    const std::string end = run.err.substr(run.err.rfind("\x1b[J"));
    EXPECT_THAT(end, testing::MatchesRegex("\x1b\\[J      4 [^\n]*\n"));
    std::size_t rows = 0;
    for (std::size_t at = 0; (at = run.err.find("%", at)) != std::string::npos; ++at) {
        ++rows;
    }
    EXPECT_EQ(rows, 1U) << "the headings, of which '95 %' is a part, stand there once";
}

TEST(SweepCommand, LogsItsPointsOffATerminal) {
    const ToolRun run = runTool(watchedSweep);
    const std::string line =
        "quarzel: K 40, 2 units, algorithm 1, 6 iterations, llr 4, [34] dB: [0-9]+ blocks, "
        "[0-9]+ block errors, BLER [^\n]*\n";
    EXPECT_THAT(run.err, testing::MatchesRegex(line + line));
}

// An interactive shell lets its jobs be interrupted; other shells, and nohup, do not.
TEST(SweepCommand, PrintsWhatIsDoneWhenItIsInterruptedWithoutAnOutput) {
    const std::string script = R"(env --default-signal=INT "$0" "$@" & sleep 0.5; kill -s INT $!; wait $!)";
    const std::vector<std::string> sweep = {"-c",  script,         QUARZEL_TOOL, "sweep",        "--ebn0",
                                            "8,9", "--max-blocks", "1e12",       "--block-size", "40"};
    const ToolRun table = runTool(sweep, {.program = "/bin/sh"});
    EXPECT_THAT(table.out, testing::StartsWith("K 40, 2 units, algorithm 1, 6 iterations, llr 4\n"));
    EXPECT_THAT(table.out, testing::HasSubstr("\n      8 "));
    EXPECT_EQ(
        table.err,
        "quarzel: error: interrupted when 0 of 2 points were done; next time name a file with -o to keep "
        "them\n");
    EXPECT_EQ(table.exitCode, 4);

    std::vector<std::string> json = sweep;
    json.push_back("--json");
    const sweep::Result result = sweep::readResult(runTool(json, {.program = "/bin/sh"}).out);
    EXPECT_FALSE(result.points.begin()->second.stoppedBy);
    EXPECT_GT(result.points.begin()->second.blocks, 0U);

    std::vector<std::string> csv = sweep;
    csv.push_back("--csv");
    EXPECT_THAT(runTool(csv, {.program = "/bin/sh"}).out,
                testing::ContainsRegex("\n40,2,1,6,llr,4,8,[^\n]*,\n"));
}

TEST(SweepCommand, IgnoresASignalThatItWasStartedToIgnore) {
    for (const char* const signal : {"INT", "HUP"}) {
        const ToolRun run = runTool({"-c",
                                     R"(trap '' "$1"
                                        "$0" sweep --ebn0 8 --block-size 40 --max-blocks 1e12 \
                                            --max-block-errors 0 --max-time 1 &
                                        sleep 0.5
                                        kill -s "$1" $!
                                        wait $!)",
                                     QUARZEL_TOOL, signal},
                                    {.program = "/bin/sh"});
        EXPECT_EQ(run.exitCode, 0) << run.err;
    }
}

TEST(SweepCommand, WritesItsResultToStandardOutput) {
    const ToolRun run = runTool(quickSweepWith({"-o", "-"}));
    EXPECT_EQ(run.out, runTool(quickSweepWith({"--json"})).out);
    EXPECT_EQ(run.err, runTool(quickSweep).out) << "the table goes to standard error";
    EXPECT_EQ(runTool({"-c", R"("$0" "$@" -o - 2>&- | "$0" verify-result -)", QUARZEL_TOOL, "sweep", "--ebn0",
                       "3", "--max-blocks", "10"},
                      {.program = "/bin/sh"})
                  .out,
              "-: the same byte for byte, 1 point with 10 blocks\n");
}

TEST(SweepCommand, TakesAllBlockSizesNamesOfAlgorithmsAndPowersOfTen) {
    const std::vector<std::string> start = {"sweep", "--ebn0", "20", "--csv"};
    const auto with = [&start](std::vector<std::string> more) {
        more.insert(more.begin(), start.begin(), start.end());
        return runTool(more).out;
    };
    const std::string all = with({"--block-size", "all", "--max-blocks", "1"});
    EXPECT_EQ(std::count(all.begin(), all.end(), '\n'), 189);
    EXPECT_EQ(with({"--max-blocks", "9", "--algorithm", "max-star,scaled-max-log,max-log"}),
              with({"--max-blocks", "9", "--algorithm", "2,1,0"}));
    EXPECT_EQ(with({"--max-blocks", "1.5e2", "--max-block-errors", "1e0"}),
              with({"--max-blocks", "150", "--max-block-errors", "1"}));
}

// The stored result comes from version 1.0.0.
TEST(VerifyResult, FindsTheResultOfAnotherVersionTheSame) {
    const std::string file = QUARZEL_SWEEP_DATA "/small_sweep.json";
    const ToolRun run = runTool({"verify-result", file});
    EXPECT_EQ(run.out, file + ": the same in every number, 12 points with 2731 blocks\n");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(VerifyResult, FindsAResultThatComesOutOtherwise) {
    const TemporaryDirectory directory;
    sweep::Result result = resultOf(smallSweep());
    pointAt(result, 1).counts[0].bitErrors += 1;
    const std::string file = directory.write("result.json", sweep::resultText(result));
    const ToolRun run = runTool({"verify-result", file});
    EXPECT_THAT(run.out, testing::StartsWith(
                             file + ": differs: K 40, 2 units, algorithm 0, 3 iterations, llr 4, 1.5 dB: "));
    EXPECT_EQ(run.exitCode, 1);
}

TEST(VerifyResult, TellsTheSameInJson) {
    const TemporaryDirectory directory;
    const std::string older = QUARZEL_SWEEP_DATA "/small_sweep.json";
    EXPECT_EQ(runTool({"verify-result", older, "--json"}).out,
              "{\"result\":\"" + older +
                  "\",\"same\":true,\"byte_for_byte\":false,\"points\":12,\"blocks\":2731,"
                  "\"difference\":null}\n");
    sweep::Result result = resultOf(smallSweep());
    const std::string same = directory.write("same.json", sweep::resultText(result));
    EXPECT_THAT(runTool({"--json", "verify-result", same}).out,
                testing::HasSubstr("\"same\":true,\"byte_for_byte\":true,"));
    pointAt(result, 1).counts[0].bitErrors += 1;
    const std::string other = directory.write("other.json", sweep::resultText(result));
    const ToolRun run = runTool({"verify-result", other, "--json"});
    EXPECT_THAT(run.out, testing::HasSubstr("\"same\":false,\"byte_for_byte\":false,"));
    EXPECT_THAT(run.out,
                testing::HasSubstr("\"difference\":\"K 40, 2 units, algorithm 0, 3 iterations, llr 4, "
                                   "1.5 dB: "));
    EXPECT_EQ(run.exitCode, 1);
}

TEST(VerifyResult, RepeatsPointsThatTimeHasEnded) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    runTool({"sweep", "--ebn0", "5", "--max-blocks", "1000000000", "--max-time", "1", "--block-size", "6144",
             "-o", file});
    EXPECT_THAT(readFile(file), testing::HasSubstr("\"stopped_by\": \"time\""));
    EXPECT_THAT(runTool({"verify-result", file}).out,
                testing::StartsWith(file + ": the same byte for byte, 1 point "));
}

}  // namespace quarzel::test
