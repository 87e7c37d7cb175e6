// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <sstream>

#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

std::vector<std::string> splitAt(const std::string& line, char separator) {
    std::vector<std::string> parts;
    std::istringstream stream(line);
    for (std::string part; std::getline(stream, part, separator);) {
        parts.push_back(part);
    }
    return parts;
}

/// A result of two points and its first failing blocks.
class RebuildCommand : public testing::Test {
  protected:
    RebuildCommand() {
        EXPECT_EQ(runTool({"sweep", "--block-size", "40", "--iterations", "3", "--ebn0", "0,1",
                           "--max-blocks", "200", "--seed", "7", "-o", itsResult, "--keep-failures", "4"})
                      .exitCode,
                  0);
        for (const std::string& line : splitAt(readFile(itsResult + ".failures/failures.csv"), '\n')) {
            itsRows.push_back(splitAt(line, ','));
        }
    }

    ToolRun rebuild(std::vector<std::string> options) {
        options.insert(options.begin(), {"rebuild", itsResult});
        return runTool(options);
    }

    TemporaryDirectory itsDirectory;
    std::string itsResult = itsDirectory.path("r.json");
    std::vector<std::vector<std::string>> itsRows;  ///< of failures.csv, with its heading
};

}  // namespace

TEST_F(RebuildCommand, MakesTheBlocksThatWereKept) {
    ASSERT_EQ(itsRows.size(), 9U);
    const std::string kept = readFile(itsResult + ".failures/k40_u2_a1_i3.soft.npy");
    const std::string keptBits = readFile(itsResult + ".failures/k40_u2_a1_i3.sent.npy");
    for (std::size_t i = 1; i < itsRows.size(); ++i) {
        const std::vector<std::string>& row = itsRows[i];
        const ToolRun run =
            rebuild({"--point", row.at(3), "--number", row.at(4), "-o", itsDirectory.path("c.npy"), "--sent",
                     itsDirectory.path("b.npy"), "--json"});
        ASSERT_EQ(run.exitCode, 0) << run.err;
        const nlohmann::json report = nlohmann::json::parse(run.out);
        EXPECT_EQ(std::to_string(report.at("bit_errors").get<int>()), row.at(6));
        EXPECT_EQ(std::to_string(report.at("block").get<int>()), row.at(4));
        EXPECT_EQ(report.at("seed"), 7);
        const std::string soft = readFile(itsDirectory.path("c.npy"));
        EXPECT_EQ(soft.substr(soft.size() - 132), kept.substr(kept.size() - 132 * (9 - i), 132)) << i;
        const std::string bits = readFile(itsDirectory.path("b.npy"));
        EXPECT_EQ(bits.substr(bits.size() - 5), keptBits.substr(keptBits.size() - 5 * (9 - i), 5)) << i;
    }
}

TEST_F(RebuildCommand, TracesTheBlockAsDecodeDoes) {
    const std::string number = itsRows.at(5).at(4);
    const ToolRun run =
        rebuild({"--point", "1", "--number", number, "--trace", "6", "-o", itsDirectory.path("c.npy")});
    EXPECT_EQ(run.exitCode, 0);
    EXPECT_EQ(run.err,
              "result        " + itsResult +
                  "\npoint         1, counted from 0: K 40, 2 units, algorithm 1, 3 iterations, llr 4, "
                  "1 dB\nblock         " +
                  number + ", counted from 0, of seed 7\nbit errors    " + itsRows.at(5).at(6) +
                  " of 40, the first at bit " + run.err.substr(run.err.rfind(' ') + 1));
    const ToolRun decoded =
        runTool({"decode", itsDirectory.path("c.npy"), "--iterations", "3", "--trace", "6"});
    EXPECT_EQ(run.out, decoded.out);
    EXPECT_THAT(run.out, testing::HasSubstr("\ndecode=0 siso=5\n"));
}

TEST_F(RebuildCommand, TakesACodeBlockOfATransportBlock) {
    ASSERT_EQ(
        runTool({"sweep", "--transport-block", "6200", "--code-rate", "1/2", "--modulation", "qpsk", "--ebn0",
                 "2", "--iterations", "2", "--max-blocks", "2", "-o", itsDirectory.path("t.json")})
            .exitCode,
        0);
    const auto rebuilt = [this](const char* block) {
        return runTool({"rebuild", itsDirectory.path("t.json"), "--number", "1", "--code-block", block});
    };
    EXPECT_THAT(rebuilt("0").out, testing::HasSubstr("\ncode block    0 of 0 to 1 (K = "));
    EXPECT_THAT(rebuilt("1").out, testing::HasSubstr("\ncode block    1 of 0 to 1 (K = "));
    EXPECT_EQ(rebuilt("2").err,
              "quarzel: error: --code-block: the block has 2 code blocks; give a number from 0 to 1\n");
    EXPECT_EQ(rebuilt("2").exitCode, 2);
}

TEST_F(RebuildCommand, RefusesWhatCannotBe) {
    const std::string error = "quarzel: error: ";
    const std::vector<std::pair<std::vector<std::string>, std::string>> cases = {
        {{"--number", "0"},
         "--point: " + itsResult +
             " has 2 points; give a number from 0 to 1, in the order of 'quarzel show'"},
        {{"--number", "0", "--point", "2"},
         "--point: " + itsResult +
             " has 2 points; give a number from 0 to 1, in the order of 'quarzel show'"},
        {{"--number", "-1"}, "--number: '-1' is not a whole number; see 'quarzel rebuild --help'"},
        {{"--point", "0"}, "--number is required; see 'quarzel rebuild --help'"},
        {{"--number", "0", "--point", "0", "-o", itsResult},
         "-o: " + itsResult + " is named twice; give another name"},
        {{"--number", "0", "--point", "0", "-o", "-"}, "-o: it needs a file of its own; name one"},
        {{"--number", "0", "--point", "0", "--json", "--trace", "1"},
         "--json: the trace goes to standard output; name a file for it with --trace-file"},
        {{"--number", "0", "--point", "0", "--trace", "1", "--trace-block", "1"},
         "--trace-block: there is one block; leave it out"}};
    for (const auto& [options, message] : cases) {
        const ToolRun run = rebuild(options);
        EXPECT_EQ(run.err, error + message + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, 2);
    }
    const ToolRun beyond = rebuild({"--number", "200", "--point", "1"});
    EXPECT_THAT(beyond.err,
                testing::MatchesRegex(error + "--number: the point has [0-9]+ blocks; give a number "
                                              "from 0 to [0-9]+\n"));
    EXPECT_EQ(beyond.exitCode, 2);
    const std::string cut = itsDirectory.write("cut.json", readFile(itsResult).substr(0, 300));
    const ToolRun broken = runTool({"rebuild", cut, "--number", "0"});
    EXPECT_EQ(
        broken.err,
        error + cut + ": is truncated or altered: it is not a whole JSON object; use another copy of it\n");
    EXPECT_EQ(broken.exitCode, 3);
}

}  // namespace quarzel::test
