// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// A command line that is wrong, and what the tool says of it after "quarzel: error: ".
struct BadUsage {
    const char* title;
    std::vector<std::string> arguments;
    std::string message;
};

void PrintTo(const BadUsage& bad, std::ostream* stream) {
    *stream << bad.title;
}

const std::string seeHelp = "; see 'quarzel --help'";
const std::string seeDecode = "; see 'quarzel decode --help'";
const std::string seeInfo = "; see 'quarzel info --help'";

const std::vector<BadUsage> badUsages = {
    {"Nothing", {}, "a command is missing" + seeHelp},
    {"UnknownCommand", {"simulate"}, "'simulate' is not understood" + seeHelp},
    {"MistypedCommand",
     {"decdoe", "a"},
     "'decdoe' is not understood; did you mean 'decode'? see 'quarzel --help'"},
    {"BeginningOfACommand",
     {"trace", "a", "b"},
     "'trace' is not understood; did you mean 'trace-diff'? see 'quarzel --help'"},
    {"MistypedOption",
     {"decode", "a", "--unit", "2"},
     "'--unit' is not understood; did you mean '--units'? see 'quarzel decode --help'"},
    {"MistypedOptionWithItsValue",
     {"decode", "a", "--refernce=b"},
     "'--refernce=b' is not understood; did you mean '--reference'? see 'quarzel decode --help'"},
    {"OptionOfAnotherCommand", {"info", "--units", "2"}, "'--units' is not understood" + seeInfo},
    {"UnknownOption", {"--fast"}, "'--fast' is not understood" + seeHelp},
    {"NoCapture", {"decode"}, "CAPTURE is required" + seeDecode},
    {"TwoCaptures", {"decode", "a", "b"}, "'b' is not understood" + seeDecode},
    {"UnknownDecodeOption", {"decode", "a", "--fast"}, "'--fast' is not understood" + seeDecode},
    {"NoValue", {"decode", "a", "--units"}, "--units: exactly one value is needed" + seeDecode},
    {"TwoValues",
     {"decode", "a", "--units", "2", "--units", "4"},
     "--units: exactly one value is needed" + seeDecode},
    {"ThreeUnits", {"decode", "a", "--units", "3"}, "--units: '3' is not 2, 4 or 8" + seeDecode},
    {"NoLlr",
     {"decode", "a", "--llr", "0"},
     "--llr: '0' is not a number above 0 and up to 1000000" + seeDecode},
    {"ScaleInWords",
     {"decode", "a", "--scale", "four"},
     "--scale: 'four' is not a number above 0 and up to 1000000" + seeDecode},
    {"LlrAndScale", {"decode", "a", "--llr", "4", "--scale", "8"}, "--scale excludes --llr" + seeDecode},
    {"NoThreads",
     {"decode", "a", "--threads", "0"},
     "--threads: '0' is not a number from 1 to 1024" + seeDecode},
    {"Algorithm3",
     {"decode", "a", "--algorithm", "3"},
     "--algorithm: '3' is not 0, 1, 2, max-log, scaled-max-log, max-star" + seeDecode},
    {"AlgorithmInWords",
     {"decode", "a", "--algorithm", "max"},
     "--algorithm: 'max' is not 0, 1, 2, max-log, scaled-max-log, max-star" + seeDecode},
    {"NoIteration",
     {"decode", "a", "--iterations", "0"},
     "--iterations: '0' is not a number from 1 to 15" + seeDecode},
    {"SixteenIterations",
     {"decode", "a", "--iterations", "16"},
     "--iterations: '16' is not a number from 1 to 15" + seeDecode},
    {"NegativeIterations",
     {"decode", "a", "--iterations", "-1"},
     "--iterations: '-1' is not a number from 1 to 15" + seeDecode},
    {"HalfAnIteration",
     {"decode", "a", "--iterations", "1.5"},
     "--iterations: '1.5' is not a number from 1 to 15" + seeDecode},
    {"OutputIsCapture", {"decode", ".", "-o", "."}, "-o: . is also read; give another name"},
    {"OutputIsReference",
     {"decode", "a", "--reference", ".", "-o", "./"},
     "-o: ./ is also read; give another name"},
    {"SizeBetweenTwo", {"info", "41"}, "K: 41 is not a block size of LTE; the nearest: 40, 48"},
    {"SizeBelowAll", {"info", "0"}, "K: 0 is not a block size of LTE; the nearest: 40"},
    {"SizeAboveAll", {"info", "6208"}, "K: 6208 is not a block size of LTE; the nearest: 6144"},
    {"SizeBeyond64Bits",
     {"info", "99999999999999999999"},
     "K: '99999999999999999999' is not a whole number" + seeInfo},
    {"NegativeSize", {"info", "-40"}, "K: '-40' is not a whole number" + seeInfo},
    {"HexadecimalSize", {"info", "0x28"}, "K: '0x28' is not a whole number" + seeInfo},
    {"PowerBelowOne", {"info", "4e-1"}, "K: '4e-1' is not a whole number" + seeInfo},
    {"PowerOfNothing", {"info", "e1"}, "K: 'e1' is not a whole number" + seeInfo},
    {"PowerThatLeavesAFraction", {"info", "4.05e1"}, "K: '4.05e1' is not a whole number" + seeInfo},
    {"PowerBeyond64Bits", {"info", "2e19"}, "K: '2e19' is not a whole number" + seeInfo},
    {"MistypedCommandWithHelp",
     {"sweeep", "--help"},
     "'sweeep' is not understood; did you mean 'sweep'? see 'quarzel --help'"},
    {"HelpOfAMistypedCommand",
     {"help", "sweeep"},
     "'sweeep' is not understood; did you mean 'sweep'? see 'quarzel --help'"},
    {"JsonOfACommandWithoutIt",
     {"--json", "manual"},
     "'--json' is not understood; see 'quarzel manual --help'"},
    {"TraceAndDecisionsToStandardOutput",
     {"decode", "a", "-o", "-", "--trace", "1"},
     "-o: the trace goes to standard output; name a file for it with --trace-file"},
    {"TwoSizes", {"info", "40", "48"}, "'48' is not understood" + seeInfo},
};

class BadUsageTest : public testing::TestWithParam<BadUsage> {};

}  // namespace

TEST_P(BadUsageTest, EndsWithOneLineThatTellsWhatIsWrong) {
    const ToolRun run = runTool(GetParam().arguments);
    EXPECT_EQ(run.err, "quarzel: error: " + GetParam().message + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 2);
}

INSTANTIATE_TEST_SUITE_P(, BadUsageTest, testing::ValuesIn(badUsages),
                         [](const auto& test) { return std::string(test.param.title); });

TEST(Usage, TakesJsonBeforeTheCommandToo) {
    EXPECT_EQ(runTool({"--json", "info", "40"}).out, runTool({"info", "40", "--json"}).out);
}

TEST(Usage, PrintsTheHelpOfACommandEitherWay) {
    EXPECT_EQ(runTool({"help"}).out, runTool({"--help"}).out);
    for (const char* command : {"sweep", "decode", "help"}) {
        const ToolRun run = runTool({"help", command});
        EXPECT_EQ(run.out, runTool({command, "--help"}).out);
        EXPECT_EQ(run.exitCode, 0);
    }
}

TEST(Usage, TakesStandardInputAndOutputAsFiles) {
    const auto pipe = [](const std::string& line) {
        return runTool({"-c", line, QUARZEL_TOOL, shipped("k40.soft.npy"), shipped("k40.decided.npy")},
                       {.program = "/bin/sh"});
    };
    EXPECT_EQ(pipe(R"(cat "$1" | "$0" decode - -o - 2>&-)").out, readFile(shipped("k40.decided.npy")));
    EXPECT_EQ(maskTimes(pipe(R"(cat "$1" | "$0" decode - -o - >/dev/null)").err),
              maskTimes(pipe(R"("$0" decode - < "$1")").out));
    EXPECT_THAT(pipe(R"(cat "$2" | "$0" decode "$1" --reference -)").out,
                testing::HasSubstr("bit errors    0 (BER 0.00e+00)\n"));
    EXPECT_EQ(pipe(R"(cat "$2" | "$0" compare - "$2")").exitCode, 0);
    EXPECT_EQ(pipe(R"(cat "$2" | "$0" compare "$2" -)").exitCode, 0);
}

TEST(Usage, ReadsNumbersInDecimalWhateverZerosTheyBeginWith) {
    EXPECT_EQ(runTool({"info", "0040"}).out, runTool({"info", "40"}).out);
    EXPECT_EQ(runTool({"info", "4e1"}).out, runTool({"info", "40"}).out);
    EXPECT_EQ(runTool({"info", "1.024E3"}).out, runTool({"info", "1024"}).out);
}

}  // namespace quarzel::test
