// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// A command line of `quarzel sweep` that is wrong, and what the tool says of it.
struct BadSweep {
    const char* title;
    std::vector<std::string> arguments;
    std::string message;
};

void PrintTo(const BadSweep& bad, std::ostream* stream) {
    *stream << bad.title;
}

const std::string seeSweep = "; see 'quarzel sweep --help'";

const std::vector<BadSweep> badSweeps = {
    {"NoEbN0", {}, "--ebn0 is required" + seeSweep},
    {"UnknownOption",
     {"--ebn0", "1", "--unit", "2"},
     "'--unit' is not understood; did you mean '--units'? see 'quarzel sweep --help'"},
    {"SizeBetweenTwo",
     {"--ebn0", "1", "--block-size", "40,41"},
     "--block-size: 41 is not a block size of LTE; the nearest: 40, 48"},
    {"ThreeUnits", {"--ebn0", "1", "--units", "2,3"}, "--units: '3' is not 2, 4 or 8" + seeSweep},
    {"Algorithm3",
     {"--ebn0", "1", "--algorithm", "3"},
     "--algorithm: '3' is not 0, 1, 2, max-log, scaled-max-log, max-star" + seeSweep},
    {"NoIteration",
     {"--ebn0", "1", "--iterations", "0"},
     "--iterations: '0' is not a number from 1 to 15" + seeSweep},
    {"ListEndsInComma", {"--ebn0", "1", "--units", "2,"}, "--units: '' is not 2, 4 or 8" + seeSweep},
    {"NoBlocks",
     {"--ebn0", "1", "--max-blocks", "0"},
     "--max-blocks: '0' is not a whole number from 1" + seeSweep},
    {"VeryManyBlocks",
     {"--ebn0", "1", "--max-blocks", "9999999999999999"},
     "the number of blocks is not from 1 to 2^40; give one that is"},
    {"TooManyPoints",
     {"--ebn0", "0:0.001:5", "--iterations", "1,2,3"},
     "there are 15003 points, more than 10000; make a range shorter or its step larger"},
    {"LoudSignal", {"--ebn0", "50"}, "Eb/N0 lies outside -20 to 40 dB; give values inside"},
    {"NoScale",
     {"--ebn0", "1", "--scale", "0"},
     "--scale: '0' is not a number above 0 and up to 1000000" + seeSweep},
    {"ScaleIsNoNumber",
     {"--ebn0", "1", "--llr", "4,x"},
     "--llr: 'x' is not a number above 0 and up to 1000000" + seeSweep},
    {"RateAbove1",
     {"--ebn0", "1", "--code-rate", "3/2"},
     "--code-rate: '3/2' is not a code rate above 0 and up to 1, as 0.5 or 1/2" + seeSweep},
    {"NoCodedBits",
     {"--ebn0", "1", "--coded-bits", "0"},
     "--coded-bits: '0' is not a number from 1 to 16777216" + seeSweep},
    {"PartOfASymbol",
     {"--ebn0", "1", "--coded-bits", "2000", "--modulation", "64qam"},
     "coded bits must be a multiple of 6, not 2000; the nearest: 1998, 2004"},
    {"CodedBitsOfAMoreThan16TimesRepeatedBlock",
     {"--ebn0", "1", "--coded-bits", "100000"},
     "a code block of 1024 bits is sent as at most 49344 coded bits here, not 100000; give sizes that fit "
     "one another"},
    {"CodeRateBeyondAllNumbersOfBits",
     {"--ebn0", "1", "--code-rate", "1e-300"},
     "a code block of 1024 bits is sent as at most 49344 coded bits here, not 16777216; give sizes that fit "
     "one another"},
    {"CodedBitsForSomeCodeBlocksAlone",
     {"--ebn0", "1", "--transport-block", "20000", "--coded-bits", "2"},
     "the code blocks need at least 4 coded bits, not 2; give sizes that fit one another"},
    {"UnknownModulation",
     {"--ebn0", "1", "--modulation", "8psk"},
     "--modulation: '8psk' is not bpsk, qpsk, 16qam, 64qam, 256qam" + seeSweep},
    {"UnknownChannel",
     {"--ebn0", "1", "--channel", "rice"},
     "--channel: 'rice' is not awgn, rayleigh, rayleigh-block" + seeSweep},
    {"UnknownDemapping",
     {"--ebn0", "1", "--demapping", "hard"},
     "--demapping: 'hard' is not exact, maxlog" + seeSweep},
    {"RedundancyVersion4", {"--ebn0", "1", "--rv", "0,4"}, "--rv: '4' is not 0, 1, 2 or 3" + seeSweep},
    {"NoTransmission", {"--ebn0", "1", "--harq", "0"}, "--harq: '0' is not a number from 1 to 32" + seeSweep},
    {"EmptyTransportBlock",
     {"--ebn0", "1", "--transport-block", "0"},
     "--transport-block: '0' is not a number from 1 to 524287" + seeSweep},
    {"TransportBlockWithoutCodedBits",
     {"--ebn0", "1", "--transport-block", "100"},
     "--transport-block: the coded bits of a transmission are not told; give --code-rate or --coded-bits"},
    {"TransportBlockWithBlockSize",
     {"--ebn0", "1", "--transport-block", "100", "--block-size", "40", "--code-rate", "1/2"},
     "--transport-block: the sizes of code blocks follow from those of transport blocks; leave out "
     "--block-size"},
    {"StopWithoutCrc",
     {"--ebn0", "1", "--stop", "crc"},
     "--stop: code blocks alone have no CRC to stop at; give --transport-block"},
    {"RetransmissionsPerIteration",
     {"--ebn0", "1", "--harq", "2", "--per-iteration"},
     "errors are counted after every iteration of one transmission without a stop; leave out "
     "--per-iteration, or --harq, --rv and --stop"},
    {"TwoForms", {"--ebn0", "1", "--json", "--csv"}, "--json excludes --csv" + seeSweep},
    {"ShardBeyondLast",
     {"--ebn0", "1", "--shard", "3/2", "-o", "x"},
     "--shard: '3/2' is not I/N; give the number of the part, from 1, and how many there are, as 1/8"},
    {"ShardWithoutFile",
     {"--ebn0", "1", "--shard", "1/2"},
     "--shard: a part is only useful in a file; name one with -o"},
    {"ShardWithTime",
     {"--ebn0", "1", "--shard", "1/2", "-o", "x", "--max-time", "3"},
     "--max-time: parts that end by time cannot be joined; leave out --max-time or --shard"},
    {"ShardWithTarget",
     {"--ebn0", "1", "--shard", "1/2", "-o", "x", "--target-bler", "0.1"},
     "--target-bler: parts do not know where the curves of others end; leave out --target-bler or --shard"},
    {"TargetIsNoRate",
     {"--ebn0", "1", "--target-bler", "2"},
     "--target-bler: '2' is not a number from 0 to 1" + seeSweep},
    {"ResumeWithoutFile",
     {"--ebn0", "1", "--resume"},
     "--resume: there is no file to go on from; name the output with -o, or the checkpoint with "
     "--checkpoint"},
    {"CheckpointIsOutput",
     {"--ebn0", "1", "-o", "x", "--checkpoint", "./x"},
     "--checkpoint: it is also the output of -o; give another name"},
};

class BadSweepTest : public testing::TestWithParam<BadSweep> {};

}  // namespace

TEST_P(BadSweepTest, EndsWithOneLineThatTellsWhatIsWrong) {
    std::vector<std::string> arguments = GetParam().arguments;
    arguments.insert(arguments.begin(), "sweep");
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.err, "quarzel: error: " + GetParam().message + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 2);
}

INSTANTIATE_TEST_SUITE_P(, BadSweepTest, testing::ValuesIn(badSweeps),
                         [](const auto& test) { return std::string(test.param.title); });

TEST(BadSweep, IsToldOfAPathThatCannotBeWrittenBeforeItWorks) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("missing/result.json");
    const ToolRun run = runTool({"sweep", "--ebn0", "9", "--max-blocks", "1000000000", "-o", file});
    EXPECT_EQ(run.err, "quarzel: error: " + file +
                           ": cannot be written: No such file or directory; create its directory first\n");
    EXPECT_EQ(run.exitCode, 3);
}

TEST(BadSweep, LeavesACheckpointAloneUnlessToldToGoOn) {
    const TemporaryDirectory directory;
    const std::string checkpoint = directory.write("result.json.checkpoint", "precious");
    const ToolRun run = runTool({"sweep", "--ebn0", "9", "-o", directory.path("result.json")});
    EXPECT_EQ(run.err,
              "quarzel: error: " + checkpoint +
                  ": is the checkpoint of an interrupted sweep; go on from it with --resume, or remove it "
                  "to begin anew\n");
    EXPECT_EQ(run.exitCode, 3);
    const ToolRun resumed =
        runTool({"sweep", "--ebn0", "9", "-o", directory.path("result.json"), "--resume"});
    EXPECT_EQ(resumed.err,
              "quarzel: error: " + checkpoint + ": is not a quarzel sweep result; give the name of one\n");
    EXPECT_EQ(resumed.exitCode, 3);
    EXPECT_EQ(readFile(checkpoint), "precious");
}

TEST(BadSweep, LeavesAFileAloneThatIsNoResult) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("result.json", "precious");
    const ToolRun run = runTool({"sweep", "--ebn0", "9", "-o", file});
    EXPECT_EQ(run.err, "quarzel: error: " + file + ": is not a quarzel sweep result; give the name of one\n");
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_EQ(readFile(file), "precious");
}

}  // namespace quarzel::test
