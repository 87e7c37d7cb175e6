// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <regex>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "trace_cases.hpp"

namespace quarzel::test {

namespace {

// Lines of the small trace, from 0: inputs at 1 to 6, the rows of pass 0 from 10, those of pass 1 from 56;
// block 1 has its inputs at 100 to 105 and the rows of its pass 0 from 109. A pass has the steps 0 to 42.
constexpr std::size_t firstPass = 10;
constexpr std::size_t secondPass = 56;
constexpr std::size_t secondBlock = 99;
constexpr std::size_t lastPass = 109;

/// The small trace, to be compared with itself after some changes.
class TraceDiff : public testing::Test {
  protected:
    /// Compare it with a text.
    ToolRun compareWith(const std::string& other, std::vector<std::string> options = {}) const {
        itsDirectory.write("b.txt", other);
        options.insert(options.begin(), {"trace-diff", a, b});
        return runTool(options);
    }

    /// The same with the lines that a test may have changed.
    ToolRun compare(const std::vector<std::string>& options = {}) const {
        return compareWith(textOf(lines), options);
    }

    /// Put another number in the place of one in a line.
    /// @param word  its number in the line, from 0
    void change(std::size_t line, std::size_t word, const std::string& number) {
        std::vector<std::string> words = wordsOf(lines.at(line));
        words.at(word) = number;
        lines[line].clear();
        for (const std::string& each : words) {
            lines[line] += each + "  ";
        }
    }

    /// What a report begins with.
    std::string head(const std::string& result) const {
        return "A             " + a + "\nB             " + b + "\nresult        " + result + '\n';
    }

    const TemporaryDirectory itsDirectory;
    const std::string text = smallTraceCase().text;
    std::vector<std::string> lines = linesOf(text);
    const std::string a = itsDirectory.write("a.txt", text);
    const std::string b = itsDirectory.path("b.txt");
    const std::string equal = head("the traces are equal") +
                              "compared      2 blocks, 3 passes: soft inputs, int, g, a, b, llr, ext\n";
};

std::string expectedError(const std::string& file, const std::string& problem) {
    return "quarzel: error: " + file + ": " + problem + '\n';
}

}  // namespace

TEST_F(TraceDiff, FindsATraceEqualToItself) {
    const ToolRun run = compare();
    EXPECT_EQ(run.out, equal);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
    EXPECT_EQ(compare({"--json"}).out,
              "{\"a\":\"" + a + "\",\"b\":\"" + b +
                  "\",\"equal\":true,\"blocks\":2,\"passes\":3,\"values\":3483,\"differ\":0,\"by_signal\":{},"
                  "\"by_pass\":[],\"termination_values\":0,\"termination_only\":false}\n");
}

TEST_F(TraceDiff, FindsEveryStoredTraceEqualToItself) {
    for (const TraceCase& trace : traceCases()) {
        const std::string file = itsDirectory.write(trace.name, trace.text);
        EXPECT_EQ(runTool({"trace-diff", file, file}).exitCode, 0) << trace.name;
    }
}

TEST_F(TraceDiff, ReadsEitherTraceFromStandardInput) {
    compare();
    for (const std::string& files : {"- " + b, a + " -"}) {
        const ToolRun run = runTool({"-c", "cat " + a + " | " + QUARZEL_TOOL + " trace-diff " + files},
                                    {.program = "/bin/sh"});
        EXPECT_NE(run.out.find("             standard input\n"), std::string::npos) << run.out;
        EXPECT_NE(run.out.find("the traces are equal\n"), std::string::npos) << run.out;
        EXPECT_EQ(run.exitCode, 0) << run.err;
    }
}

TEST_F(TraceDiff, RefusesToReadBothTracesFromStandardInput) {
    const ToolRun run = runTool({"trace-diff", "-", "-"});
    EXPECT_EQ(run.err, expectedError("B", "standard input is already read as A; name a file"));
    EXPECT_EQ(run.exitCode, 2);
}

TEST_F(TraceDiff, OverlooksCarriageReturnsAndBlanksAtTheEndsOfLines) {
    for (const char* end : {"\r\n", "   \n", " \t\r\n"}) {
        std::string other;
        for (const std::string& line : lines) {
            other += line + end;
        }
        EXPECT_EQ(compareWith(other).out, equal);
    }
}

TEST_F(TraceDiff, OverlooksHowANumberIsWritten) {
    EXPECT_EQ(compareWith(std::regex_replace(text, std::regex("(\\.[0-9]*[1-9])0+"), "$1")).out, equal);
    EXPECT_EQ(compareWith(std::regex_replace(text, std::regex("\\.000000"), "")).out, equal);
    EXPECT_EQ(compareWith(std::regex_replace(text, std::regex("\\+0\\.000000"), "-0.0")).out, equal);
    EXPECT_EQ(compareWith(std::regex_replace(text, std::regex("\\+"), "")).out, equal);
    EXPECT_EQ(compareWith(std::regex_replace(text, std::regex("  +"), " ")).out, equal);
}

TEST_F(TraceDiff, OverlooksRulersWarningsAndEmptyLinesBetweenTables) {
    lines[0] = "---";
    lines.insert(lines.begin() + secondBlock,
                 {"", "WARNING:decoder:Input block tag has been truncated", "  "});
    lines.push_back("");
    EXPECT_EQ(compare().out, equal);
}

TEST_F(TraceDiff, NamesEverySignalAndState) {
    const std::vector<std::pair<std::string, int>> columns = {
        {"int", -1}, {"a", 0}, {"a", 1}, {"a", 2}, {"a", 3}, {"a", 4},    {"a", 5},   {"a", 6},
        {"a", 7},    {"b", 0}, {"b", 1}, {"b", 2}, {"b", 3}, {"b", 4},    {"b", 5},   {"b", 6},
        {"b", 7},    {"g", 4}, {"g", 5}, {"g", 6}, {"g", 7}, {"llr", -1}, {"ext", -1}};
    const std::vector<std::string> original = lines;
    for (std::size_t column = 0; column < columns.size(); ++column) {
        const std::size_t step = 3 + column;
        const double value = std::stod(wordsOf(original[secondPass + step]).at(1 + column));
        lines = original;
        change(secondPass + step, 1 + column, std::to_string(value + 0.125));
        const ToolRun run = compare({"--json"});
        ASSERT_EQ(run.exitCode, 1) << run.err;
        const auto report = nlohmann::json::parse(run.out);
        const auto& [signal, state] = columns[column];
        EXPECT_EQ(report["equal"], false);
        EXPECT_EQ(report["block"], 0);
        EXPECT_EQ(report["pass"], 1);
        EXPECT_EQ(report["code"], 1);
        EXPECT_EQ(report["step"], step);
        EXPECT_EQ(report["signal"], signal);
        EXPECT_EQ(report["state"], state < 0 ? nlohmann::json() : nlohmann::json(state));
        EXPECT_EQ(report["value_a"]["real"], value);
        EXPECT_EQ(report["value_b"]["real"], value + 0.125);
        EXPECT_EQ(report["value_a"]["raw"], static_cast<int>(8 * value));
        EXPECT_EQ(report["value_b"]["raw"], static_cast<int>(8 * value) + 1);
        EXPECT_EQ(report["value_a"]["line"], secondPass + step + 1);
        EXPECT_EQ(report["value_b"]["line"], secondPass + step + 1);
        EXPECT_EQ(report["differ"], 1);
        EXPECT_EQ(report["termination_only"], false);
    }
}

TEST_F(TraceDiff, NamesEveryStreamOfSoftInputs) {
    const std::vector<std::string> streams = {"code1_sys", "code1_par0", "code1_par1",
                                              "code2_sys", "code2_par0", "code2_par1"};
    const std::vector<std::string> original = lines;
    for (std::size_t stream = 0; stream < streams.size(); ++stream) {
        lines = original;
        std::string& line = lines.at(secondBlock + 1 + stream);
        const std::size_t last = line.rfind(' ') + 1;
        const int word = std::stoi(line.substr(last));
        line = line.substr(0, last) + std::to_string(word + 16) + ']';
        const ToolRun run = compare({"--json"});
        ASSERT_EQ(run.exitCode, 1) << run.err;
        const auto report = nlohmann::json::parse(run.out);
        EXPECT_EQ(report["block"], 1);
        EXPECT_EQ(report["pass"], nlohmann::json());
        EXPECT_EQ(report["code"], nlohmann::json());
        EXPECT_EQ(report["step"], 42);
        EXPECT_EQ(report["signal"], streams[stream]);
        EXPECT_EQ(report["state"], nlohmann::json());
        EXPECT_EQ(report["value_a"]["raw"], word / 16);
        EXPECT_EQ(report["value_b"]["raw"], word / 16 + 1);
        EXPECT_EQ(report["value_b"]["real"], (word / 16 + 1) / 8.0);
        EXPECT_EQ(report["value_b"]["line"], secondBlock + 2 + stream);
        EXPECT_EQ(report["differ"], 1);
    }
}

TEST_F(TraceDiff, ReportsTheFirstValueThatDiffersWithWhyAndTheStepsAroundIt) {
    change(secondPass + 17, 19, "-9.25");
    change(secondPass + 18, 18, "+0.125000");
    change(secondPass + 30, 22, "0");
    const ToolRun run = compare();
    EXPECT_EQ(run.out, head("the traces differ") +
                           "compared      2 blocks, 3 passes: soft inputs, int, g, a, b, llr, ext\n"
                           "block         0\n"
                           "pass          1: constituent code 1 in natural order\n"
                           "step          17 of 0 to 42\n"
                           "signal        g5: branch metric\n"
                           "value in A    +0.125000, raw 1, line 74\n"
                           "value in B    -9.250000, raw -74, line 74\n"
                           "differ        3 of 3483 values\n"
                           "by signal     g 2, llr 1\n"
                           "by pass       pass 1 of block 0: 3\n"
                           "recomputed    g5 of step 17 is 75 low\n"
                           "              x, twice the intrinsic value, is the systematic value and half the "
                           "extrinsic value of step 29 in pass 0, -11 + 7 = -4\n"
                           "              x - p + q = -4 - (-5) + 0 = 1, clamped to -128 to 127: 1\n"
                           "              B has the same inputs: the fault is in this step\n"
                           "\n"
                           "step   raw     g4     g5     g6     g7\n"
                           "  14  A        -7     -7     -3     -3\n"
                           "  14  B        -7     -7     -3     -3\n"
                           "  15  A        -4     -4     -6     -6\n"
                           "  15  B        -4     -4     -6     -6\n"
                           "  16  A       -17    -17     17     17\n"
                           "  16  B       -17    -17     17     17\n"
                           "  17  A         1      1     -9     -9\n"
                           "  17  B         1   *-74     -9     -9\n"
                           "  18  A        -2     -2      6      6\n"
                           "  18  B        *1     -2      6      6\n"
                           "  19  A         3      3    -57    -57\n"
                           "  19  B         3      3    -57    -57\n"
                           "  20  A        -8     -8    -16    -16\n"
                           "  20  B        -8     -8    -16    -16\n");
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(TraceDiff, ReportsASoftInputThatDiffers) {
    lines[secondBlock + 2].replace(0, 27, "itsPar0[0]=[272 -16 32 256 ");
    const ToolRun run = compare();
    EXPECT_EQ(run.out, head("the traces differ") +
                           "compared      2 blocks, 3 passes: soft inputs, int, g, a, b, llr, ext\n"
                           "block         1\n"
                           "pass          none: soft inputs of the block\n"
                           "step          1 of 0 to 42\n"
                           "signal        code1_par0: first parity of constituent code 1\n"
                           "value in A    +0.875000, raw 7, line 102\n"
                           "value in B    -0.125000, raw -1, line 102\n"
                           "differ        2 of 3483 values\n"
                           "by signal     code1_par0 2\n"
                           "by pass       soft inputs of block 1: 2\n"
                           "\n"
                           "step   raw code1_par0\n"
                           "   0  A            17\n"
                           "   0  B            17\n"
                           "   1  A             7\n"
                           "   1  B           *-1\n"
                           "   2  A             1\n"
                           "   2  B            *2\n"
                           "   3  A            16\n"
                           "   3  B            16\n"
                           "   4  A           -11\n"
                           "   4  B           -11\n");
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(TraceDiff, ReportsADifferenceInTheFirstStep) {
    change(firstPass, 22, "0.25");
    EXPECT_EQ(compare().out, head("the traces differ") +
                                 "compared      2 blocks, 3 passes: soft inputs, int, g, a, b, llr, ext\n"
                                 "block         0\n"
                                 "pass          0: constituent code 2 in interleaved order\n"
                                 "step          0 of 0 to 42\n"
                                 "signal        llr: log-likelihood ratio\n"
                                 "value in A    +5.500000, raw 44, line 11\n"
                                 "value in B    +0.250000, raw 2, line 11\n"
                                 "differ        1 of 3483 values\n"
                                 "by signal     llr 1\n"
                                 "by pass       pass 0 of block 0: 1\n"
                                 "recomputed    llr of step 0 is 42 low\n"
                                 "              the best path of bit 1 is a0 + g7 + b4: 711\n"
                                 "              the best path of bit 0 is a0 - g7 + b0: 667\n"
                                 "              their difference is 44\n"
                                 "              B has the same inputs: the fault is in this step\n"
                                 "\n"
                                 "step   raw    llr\n"
                                 "   0  A        44\n"
                                 "   0  B        *2\n"
                                 "   1  A         2\n"
                                 "   1  B         2\n"
                                 "   2  A         2\n"
                                 "   2  B         2\n"
                                 "   3  A       -54\n"
                                 "   3  B       -54\n");
}

TEST_F(TraceDiff, TellsWhenOnlyTerminationStepsDiffer) {
    change(secondPass + 42, 23, "0.25");
    change(lastPass + 41, 23, "0.25");
    const ToolRun run = compare();
    EXPECT_EQ(run.out, head("the traces differ in termination steps alone") +
                           "compared      2 blocks, 3 passes: soft inputs, int, g, a, b, llr, ext\n"
                           "block         0\n"
                           "pass          1: constituent code 1 in natural order\n"
                           "step          42 of 0 to 42\n"
                           "signal        ext: extrinsic value\n"
                           "value in A    -0.750000, raw -6, line 99\n"
                           "value in B    +0.250000, raw 2, line 99\n"
                           "differ        2 of 3483 values\n"
                           "by signal     ext 2\n"
                           "by pass       pass 1 of block 0: 1\n"
                           "              pass 0 of block 1: 1\n"
                           "note          hardware does not compute the termination steps, which hold every\n"
                           "              difference of these traces; see --ignore-termination\n"
                           "\n"
                           "step   raw    ext\n"
                           "  39  A        28\n"
                           "  39  B        28\n"
                           "  40  A        13\n"
                           "  40  B        13\n"
                           "  41  A         6\n"
                           "  41  B         6\n"
                           "  42  A        -6\n"
                           "  42  B        *2\n");
    EXPECT_EQ(run.exitCode, 1);
    const auto report = nlohmann::json::parse(compare({"--json"}).out);
    EXPECT_EQ(report["termination_only"], true);
    EXPECT_EQ(report["termination_values"], 2);
}

TEST_F(TraceDiff, NamesADifferenceElsewhereBeforeOneInTerminationSteps) {
    change(secondPass + 42, 23, "0.25");
    change(lastPass + 39, 23, "0.25");
    const ToolRun run = compare();
    EXPECT_NE(run.out.find("\nresult        the traces differ\n"), std::string::npos);
    EXPECT_NE(run.out.find("\nblock         1\n"), std::string::npos);
    EXPECT_NE(run.out.find("\nstep          39 of 0 to 42\n"), std::string::npos) << run.out;
    EXPECT_NE(run.out.find("\ndiffer        2 of "), std::string::npos) << run.out;
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(TraceDiff, IgnoresTerminationStepsOnDemand) {
    for (const std::size_t step : {40U, 41U, 42U}) {
        change(firstPass + step, 1 + step % 3, "-99");
        change(lastPass + step, 20, "-99");
    }
    const ToolRun run = compare({"--ignore-termination"});
    EXPECT_EQ(run.out, head("the traces are equal but for termination steps") +
                           "compared      2 blocks, 3 passes: soft inputs, int, g, a, b, llr, ext\n"
                           "ignored       6 values that differ of termination steps\n");
    EXPECT_EQ(run.exitCode, 0);
    const auto report = nlohmann::json::parse(compare({"--ignore-termination", "--json"}).out);
    EXPECT_EQ(report["equal"], true);
    EXPECT_EQ(report["termination_values"], 6);
    EXPECT_EQ(report["termination_only"], true);
}

TEST_F(TraceDiff, FindsADifferenceBehindIgnoredTerminationSteps) {
    change(firstPass + 40, 1, "-99");
    change(secondPass + 39, 23, "-99");
    change(secondPass + 42, 23, "-99");
    const auto report = nlohmann::json::parse(compare({"--ignore-termination", "--json"}).out);
    EXPECT_EQ(report["pass"], 1);
    EXPECT_EQ(report["step"], 39);
    EXPECT_EQ(report["signal"], "ext");
    EXPECT_EQ(report["differ"], 1) << "what is ignored does not count";
    EXPECT_EQ(report["termination_only"], false);
}

TEST_F(TraceDiff, DoesNotMissTerminationStepsThatAreIgnored) {
    for (const std::size_t pass : {lastPass, secondPass, firstPass}) {
        lines.erase(lines.begin() + static_cast<std::ptrdiff_t>(pass) + 40,
                    lines.begin() + static_cast<std::ptrdiff_t>(pass) + 43);
    }
    const ToolRun run = compare({"--ignore-termination"});
    EXPECT_EQ(run.out, equal);
    EXPECT_EQ(run.exitCode, 0);
    const ToolRun strict = compare();
    EXPECT_EQ(
        strict.err,
        expectedError(b,
                      "lines 11 to 50 hold pass 0 of block 0 without int of step 40; expected steps 0 to "
                      "42, with the termination steps"));
    EXPECT_EQ(strict.exitCode, 3);
}

TEST_F(TraceDiff, ReportsAValueNextToMissingTerminationSteps) {
    lines.resize(lastPass + 40);
    change(lastPass + 38, 22, "0");
    const ToolRun run = compare({"--ignore-termination"});
    EXPECT_NE(run.out.find("\n  39  B"), std::string::npos) << run.out;
    EXPECT_NE(run.out.find("\n  40  B         -"), std::string::npos) << run.out;
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(TraceDiff, TellsWhichTraceEndsFirst) {
    lines.resize(secondBlock);
    const ToolRun shorter = compare();
    EXPECT_EQ(shorter.out, head("the traces differ: B lacks something") +
                               "compared      1 block, 2 passes: soft inputs, int, g, a, b, llr, ext\n"
                               "next in A     block 1\n"
                               "next in B     nothing, it has ended\n");
    EXPECT_EQ(shorter.exitCode, 1);

    const ToolRun longer = runTool({"trace-diff", b, a, "--json"});
    EXPECT_EQ(longer.out, "{\"a\":\"" + b + "\",\"b\":\"" + a +
                              "\",\"equal\":false,\"blocks\":1,\"passes\":2,\"values\":2236,\"differ\":0,"
                              "\"by_signal\":{},\"by_pass\":[],\"termination_values\":0,"
                              "\"termination_only\":false,\"next_a\":null,\"next_b\":{\"block\":1,"
                              "\"pass\":null}}\n");
    EXPECT_EQ(longer.exitCode, 1);
}

TEST_F(TraceDiff, TellsThatAPassIsMissing) {
    lines.resize(secondPass - 3);
    const ToolRun run = compare();
    EXPECT_EQ(run.out, head("the traces differ: B lacks something") +
                           "compared      1 block, 1 pass: soft inputs, int, g, a, b, llr, ext\n"
                           "next in A     pass 1 of block 0\n"
                           "next in B     no pass 1 of block 0\n");
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(TraceDiff, TellsOfAnotherPassAndOfABlockThatOneLacks) {
    lines[secondPass - 2] = "decode=0 siso=3";
    EXPECT_EQ(compare().out, head("the traces differ: B lacks something") +
                                 "compared      2 blocks, 2 passes: soft inputs, int, g, a, b, llr, ext\n"
                                 "next in A     pass 1 of block 0\n"
                                 "next in B     no pass 1 of block 0\n");
    lines = linesOf(text);
    lines[lastPass - 2] = "decode=2 siso=0";
    EXPECT_EQ(compare().out, head("the traces differ: they go on with different blocks") +
                                 "compared      1 block, 2 passes: soft inputs, int, g, a, b, llr, ext\n"
                                 "next in A     block 1\n"
                                 "next in B     block 2\n");
}

TEST_F(TraceDiff, RefusesATraceOfAnotherBlockSize) {
    const ToolRun run = compareWith(traceCases().back().text);
    EXPECT_EQ(run.err,
              expectedError(b,
                            "lines 2 to 7 hold soft inputs of block 0 with step 514; expected steps 0 to "
                            "42, with the termination steps"));
    EXPECT_EQ(run.exitCode, 3);
}

TEST_F(TraceDiff, HoldsAFewBlocksOfATraceInMemory) {
    const std::string large = itsDirectory.path("large.txt");
    const ToolRun made = runTool(
        {"decode", shipped("k6144.soft.npy"), "--iterations", "3", "--trace", "40", "--trace-file", large});
    ASSERT_EQ(made.exitCode, 0) << made.err;
    constexpr unsigned long memoryLimit = 64UL << 20;
    ASSERT_GT(readFile(large).size(), memoryLimit);
    const ToolRun run = runTool({"trace-diff", large, large}, {.memoryLimit = memoryLimit});
    EXPECT_EQ(run.out,
              "A             " + large + "\nB             " + large +
                  "\nresult        the traces are equal\ncompared      7 blocks, 40 passes: soft inputs, "
                  "int, g, a, b, llr, ext\n");
    EXPECT_EQ(run.exitCode, 0) << run.err;
}

TEST_F(TraceDiff, NeedsTwoFilesThatCanBeRead) {
    const std::string none = itsDirectory.path("none.txt");
    EXPECT_EQ(runTool({"trace-diff", a, none}).err,
              expectedError(none, "cannot be opened: No such file or directory; check the name"));
    EXPECT_EQ(runTool({"trace-diff", a, "/proc/self/mem"}).err,
              expectedError("/proc/self/mem", "cannot be read beyond line 0; copy it again"));
    const std::string directory = itsDirectory.path("");
    EXPECT_EQ(runTool({"trace-diff", directory, a}).err,
              expectedError(directory, "is a directory; give the name of a file"));
    const ToolRun run = runTool({"trace-diff", a});
    EXPECT_EQ(run.err, "quarzel: error: B is required; see 'quarzel trace-diff --help'\n");
    EXPECT_EQ(run.exitCode, 2);
}

}  // namespace quarzel::test
