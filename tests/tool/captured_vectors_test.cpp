// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// `quarzel vectors` with the blocks of a capture.
class CapturedVectors : public testing::Test {
  protected:
    ToolRun make(const std::string& capture, std::vector<std::string> options = {}) {
        options.insert(options.begin(), {"vectors", itsSet, "--capture", capture});
        return runTool(options);
    }

    std::string fileOf(const std::string& core, const std::string& name) {
        return readFile(itsSet + '/' + core + '/' + name);
    }

    TemporaryDirectory itsDirectory;
    std::string itsSet = itsDirectory.path("set");
};

}  // namespace

TEST_F(CapturedVectors, HoldTheBlocksOfTheCaptureForEachCore) {
    const std::string capture = shipped("k40.soft.npy");
    ASSERT_EQ(make(capture, {"--units", "2,8", "--iterations", "6,3"}).exitCode, 0);
    EXPECT_EQ(fileOf("u8_a1", "npy/k40_i6.soft.npy"), readFile(capture));
    EXPECT_EQ(fileOf("u2_a1", "npy/k40_i3.soft.npy"), readFile(capture));
    EXPECT_EQ(fileOf("u8_a1", "npy/k40_i6.decided.npy"), readFile(shipped("k40.decided.npy")));
    const nlohmann::json manifest = nlohmann::json::parse(readFile(itsSet + "/manifest.json"));
    const nlohmann::json& blocks = manifest.at("cores")[0].at("blocks");
    EXPECT_EQ(blocks.size(), 800U);
    EXPECT_EQ(blocks[403], nlohmann::json::parse(R"({"block": 403, "block_size": 40, "iterations": 3,
        "stimulus": "capture", "capture": "npy/k40_i3.soft.npy", "row": 3})"));
    const nlohmann::json& configuration = manifest.at("configuration");
    EXPECT_EQ(configuration.at("capture"), capture);
    EXPECT_EQ(configuration.at("command"), "quarzel vectors DIRECTORY --capture " + capture +
                                               " --units 2,8 --algorithm 1 --iterations 6,3");
    const std::string actual = itsDirectory.write("sim.hex", fileOf("u8_a1", "dout.hex"));
    EXPECT_EQ(runTool({"compare", itsSet + "/u8_a1", actual}).exitCode, 0);
}

TEST_F(CapturedVectors, AreTheSameWithAnyNumberOfThreads) {
    const std::string capture = shipped("k40.soft.npy");
    ASSERT_EQ(make(capture, {"--threads", "1"}).exitCode, 0);
    const std::string manifest = readFile(itsSet + "/manifest.json");
    ASSERT_EQ(make(capture, {"--threads", "3", "--replace"}).exitCode, 0);
    EXPECT_EQ(readFile(itsSet + "/manifest.json"), manifest);
}

TEST_F(CapturedVectors, SaturateAsTheCoreDoes) {
    xt::xarray<std::int16_t> soft = xt::zeros<std::int16_t>({1, 3, 44});
    soft(0, 0, 0) = 300;
    soft(0, 0, 1) = -129;
    const std::string capture = itsDirectory.path("capture.npy");
    xt::dump_npy(capture, soft);
    ASSERT_EQ(make(capture).exitCode, 0);
    EXPECT_TRUE(
        fileOf("u2_a1", "rsc1_sys.hex").starts_with("// block 0: K 40, 6 iterations, capture\n7f\n80\n00\n"));
    const std::string decided = itsDirectory.path("decided.npy");
    ASSERT_EQ(runTool({"decode", capture, "-o", decided}).exitCode, 0);
    EXPECT_EQ(fileOf("u2_a1", "npy/k40_i6.decided.npy"), readFile(decided));
}

TEST_F(CapturedVectors, TakeRealNumbersWithAScale) {
    const std::string capture = itsDirectory.path("reals.npy");
    xt::dump_npy(capture, xt::xarray<float>(0.5F * xt::ones<float>({1, 3, 44})));
    EXPECT_EQ(make(capture).exitCode, 3);
    ASSERT_EQ(make(capture, {"--llr", "4"}).exitCode, 0);
    EXPECT_TRUE(fileOf("u2_a1", "rsc2_par.hex").ends_with("\n02\n02\n"));
    const nlohmann::json manifest = nlohmann::json::parse(readFile(itsSet + "/manifest.json"));
    EXPECT_EQ(
        manifest.at("configuration").at("command"),
        "quarzel vectors DIRECTORY --capture " + capture + " --units 2 --algorithm 1 --iterations 6 --llr 4");
}

TEST_F(CapturedVectors, RefuseWhatTheCaptureTellsItself) {
    const std::string capture = shipped("k40.soft.npy");
    const std::vector<std::vector<std::string>> others = {{"--block-size", "40"}, {"--stimulus", "noise"},
                                                          {"--blocks", "3"},      {"--ebn0", "1"},
                                                          {"--seed", "1"},        {"--cover"},
                                                          {"--cover-sizes"},      {"--rv", "0"}};
    for (const std::vector<std::string>& other : others) {
        const ToolRun run = make(capture, other);
        EXPECT_EQ(run.err, "quarzel: error: " + other.front() +
                               ": does not go with --capture, which has the blocks; leave it out\n");
        EXPECT_EQ(run.exitCode, 2);
    }
    const std::string missing = itsDirectory.path("missing.npy");
    EXPECT_EQ(make(missing).exitCode, 3);
    EXPECT_EQ(itsDirectory.names(), std::vector<std::string>());
}

}  // namespace quarzel::test
