// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "golden.hpp"
#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

void expectRefused(const std::vector<std::string>& arguments, int exitCode, const std::string& message) {
    std::vector<std::string> all = {"coverage"};
    all.insert(all.end(), arguments.begin(), arguments.end());
    const ToolRun run = runTool(all);
    EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, exitCode);
}

}  // namespace

// The table of what is reached: every position of every event that a core has the circuit for.
TEST(CoverageCommand, FindsEveryEventReachedByTheCoveringSetOfEveryCore) {
    const TemporaryDirectory directory;
    ASSERT_EQ(runTool({"vectors", directory.path("set"), "--cover"}).exitCode, 0);
    const ToolRun run = runTool({"coverage", "--vectors", directory.path("set"), "--json"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const nlohmann::json cores = nlohmann::json::parse(run.out).at("cores");
    ASSERT_EQ(cores.size(), 9U);
    const std::size_t events[] = {27, 28, 34};
    const std::size_t positions[] = {143, 145, 329};
    for (const nlohmann::json& core : cores) {
        const std::size_t algorithm = core.at("algorithm");
        EXPECT_EQ(core.at("events").size(), events[algorithm]) << core.at("core");
        EXPECT_EQ(core.at("of"), positions[algorithm]) << core.at("core");
        EXPECT_EQ(core.at("reached"), core.at("of"));
        for (const auto& [event, counts] : core.at("events").items()) {
            for (const auto& [position, count] : counts.items()) {
                EXPECT_GT(count, 0) << core.at("core") << ' ' << event << ' ' << position;
            }
        }
    }
}

TEST(CoverageCommand, PrintsATableForACapture) {
    const ToolRun run = runTool({"coverage", shipped("k40.soft.npy"), "--algorithm", "2", "--units", "4"});
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
    expectGolden(run.out, "coverage.txt");
}

TEST(CoverageCommand, GivesTheSameWhateverTheNumberOfThreads) {
    const ToolRun one = runTool({"coverage", shipped("k40.soft.npy"), "--json", "--threads", "1"});
    EXPECT_EQ(one.exitCode, 0);
    EXPECT_EQ(runTool({"coverage", shipped("k40.soft.npy"), "--json", "--threads", "3"}).out, one.out);
}

TEST(CoverageCommand, CountsASetAsItCountsItsCaptures) {
    const TemporaryDirectory directory;
    ASSERT_EQ(runTool({"vectors", directory.path("set"), "--block-size", "512", "--units", "8", "--algorithm",
                       "0", "--iterations", "3", "--stimulus", "noise,ties"})
                  .exitCode,
              0);
    const ToolRun ofSet = runTool({"coverage", "--vectors", directory.path("set")});
    const ToolRun ofCapture = runTool({"coverage", directory.path("set/u8_a0/npy/k512_i3.soft.npy"),
                                       "--units", "8", "--algorithm", "0", "--iterations", "3"});
    EXPECT_EQ(ofSet.exitCode, 0) << ofSet.err;
    EXPECT_EQ(ofSet.out, ofCapture.out);
}

TEST(CoverageCommand, RefusesWhatItCannotCount) {
    const TemporaryDirectory directory;
    expectRefused({}, 2, "neither a capture nor --vectors is given; see 'quarzel coverage --help'");
    expectRefused({shipped("k40.soft.npy"), "--vectors", directory.path("set")}, 2,
                  "CAPTURE: does not go with --vectors, which tells all; leave it out");
    expectRefused({"--units", "4", "--vectors", directory.path("set")}, 2,
                  "--units: does not go with --vectors, which tells all; leave it out");
    ASSERT_EQ(runTool({"vectors", directory.path("set")}).exitCode, 0);
    const std::string file = "set/u2_a1/npy/k40_i6.soft.npy";
    const std::string bytes = readFile(directory.path(file));
    for (const std::size_t size : {std::size_t{0}, bytes.size() / 2, bytes.size() - 1}) {
        directory.write(file, bytes.substr(0, size));
        expectRefused({"--vectors", directory.path("set")}, 3,
                      directory.path(file) +
                          ": is not the file that was made with this set: its SHA-256 differs; "
                          "make the set again with 'quarzel vectors'");
    }
    directory.write(file, bytes);
    const std::string manifest = readFile(directory.path("set/manifest.json"));
    nlohmann::ordered_json changed = nlohmann::ordered_json::parse(manifest);
    changed["cores"][0]["blocks"][0]["row"] = 10;
    directory.write("set/manifest.json", changed.dump());
    expectRefused({"--vectors", directory.path("set")}, 3,
                  directory.path(file) + ": has no block 10; make the set again with 'quarzel vectors'");
    changed["cores"][0]["blocks"][0]["row"] = 0;
    changed["cores"][0]["units"] = 3;
    directory.write("set/manifest.json", changed.dump());
    const ToolRun run = runTool({"coverage", "--vectors", directory.path("set"), "--threads", "1"});
    EXPECT_NE(run.err.find("C_NUM_PU must be either 2, 4 or 8"), std::string::npos) << run.err;
    EXPECT_EQ(run.exitCode, 1);
    directory.write("set/manifest.json", manifest.substr(0, manifest.size() / 2));
    expectRefused({"--vectors", directory.path("set")}, 3,
                  directory.path("set/manifest.json") +
                      ": is truncated or altered: it is not a whole JSON object; make the set again with "
                      "'quarzel vectors'");
}

}  // namespace quarzel::test
