// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <filesystem>
#include <map>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>

#include "golden.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace fs = std::filesystem;

namespace quarzel::test {

namespace {

class LinkVectors : public testing::Test {
  protected:
    ToolRun make(std::vector<std::string> options, const std::string& name = "set") {
        options.insert(options.begin(), {"vectors", itsDirectory.path(name)});
        return runTool(options);
    }

    /// Every file of a set, by name.
    std::map<std::string, std::string> files(const std::string& name = "set") {
        std::map<std::string, std::string> files;
        const std::string directory = itsDirectory.path(name);
        for (const auto& entry : fs::recursive_directory_iterator(directory)) {
            if (entry.is_regular_file()) {
                files[entry.path().lexically_relative(directory).string()] = readFile(entry.path().string());
            }
        }
        return files;
    }

    void expectRefused(const std::vector<std::string>& options, const std::string& message) {
        const ToolRun run = make(options);
        EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, 2);
        EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{});
    }

    TemporaryDirectory itsDirectory;
};

/// One transport block of 10 bits: 6 filler bits, two transmissions that begin at different places.
const std::vector<std::string> small = {"--transport-block", "10",   "--coded-bits", "60",  "--blocks", "1",
                                        "--modulation",      "qpsk", "--rv",         "0,2", "--ebn0",   "4"};

}  // namespace

TEST_F(LinkVectors, AreTheStoredOnes) {
    ASSERT_EQ(make(small).exitCode, 0);
    std::string text;
    for (const auto& [name, bytes] : files()) {
        if (name.ends_with(".hex") || name.ends_with(".vh")) {
            text.append("== ").append(name).append("\n").append(bytes);
        }
    }
    expectGolden(text, "link_vectors.txt");
}

TEST_F(LinkVectors, TellInTheManifestWhatEachFileHolds) {
    ASSERT_EQ(make(small).exitCode, 0);
    const nlohmann::json manifest = nlohmann::json::parse(files().at("manifest.json"));
    std::set<std::string> known;
    for (const nlohmann::json& file : manifest.at("files")) {
        known.insert(file.at("name"));
    }
    std::string text;
    for (const nlohmann::json& stage : manifest.at("stages")) {
        EXPECT_EQ(known.count(stage.at("file")), 1U) << stage;
        for (const char* const key : {"file", "holds", "word", "clause"}) {
            text += stage.at(key).get<std::string>() + (std::string(key) == "clause" ? "\n" : " | ");
        }
    }
    expectGolden(text, "link_stages.txt");
    EXPECT_EQ(manifest.at("configuration").at("link").dump(),
              R"({"block_size":0,"channel":"awgn","coded_bits":60,"demapping":"maxlog",)"
              R"("modulation":"qpsk","redundancy_versions":[0,2],"transport_block":10})");
}

TEST_F(LinkVectors, AreTheSameBytesWhateverTheNumberOfThreadsAndAgainByTheirCommand) {
    const std::vector<std::string> options = {"--transport-block",
                                              "6300",
                                              "--code-rate",
                                              "3/4",
                                              "--modulation",
                                              "64qam",
                                              "--channel",
                                              "rayleigh-block",
                                              "--rv",
                                              "0,3",
                                              "--harq",
                                              "3",
                                              "--iterations",
                                              "1,4",
                                              "--seed",
                                              "9",
                                              "--blocks",
                                              "4",
                                              "--units",
                                              "2,8",
                                              "--ebn0",
                                              "6"};
    for (const char* const threads : {"1", "3"}) {
        std::vector<std::string> all = options;
        all.insert(all.end(), {"--threads", threads});
        ASSERT_EQ(make(all, threads).exitCode, 0);
    }
    const std::map<std::string, std::string> first = files("1");
    EXPECT_TRUE(files("3") == first);
    const nlohmann::json configuration = nlohmann::json::parse(first.at("manifest.json")).at("configuration");
    EXPECT_EQ(configuration.at("link").at("coded_bits"), 8400);
    EXPECT_EQ(configuration.at("link").at("redundancy_versions"), (std::vector<unsigned>{0, 3, 0}));
    std::istringstream words(configuration.at("command").get<std::string>());
    std::vector<std::string> arguments{std::istream_iterator<std::string>(words), {}};
    arguments.erase(arguments.begin());
    arguments[1] = itsDirectory.path("again");
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.exitCode, 0) << run.err;
    EXPECT_TRUE(files("again") == first);
}

TEST_F(LinkVectors, AreWhatCompareExpects) {
    ASSERT_EQ(make(small).exitCode, 0);
    const std::string core = itsDirectory.path("set/u2_a1");
    std::string decisions = readFile(core + "/dout.hex");
    const std::string simulated = itsDirectory.write("simulated.hex", decisions);
    EXPECT_EQ(runTool({"compare", core, simulated}).exitCode, 0);
    decisions[decisions.size() - 2] ^= 1;  // the last bit after the second transmission
    itsDirectory.write("simulated.hex", decisions);
    const ToolRun run = runTool({"compare", core, simulated});
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_NE(
        run.out.find("block         1 of 0 to 1 (K = 40, 6 iterations, transport block 0, transmission 1, "
                     "code block 0)\n"),
        std::string::npos)
        << run.out;
}

TEST_F(LinkVectors, AreRefusedForSizesThatDoNotFit) {
    expectRefused({"--transport-block", "0", "--coded-bits", "60"},
                  "--transport-block: '0' is not a number from 1 to 524287; see 'quarzel vectors --help'");
    expectRefused(
        {"--transport-block", "40"},
        "--transport-block: does not tell how many bits are sent; give --coded-bits or --code-rate");
    expectRefused({"--transport-block", "40", "--coded-bits", "0"},
                  "--coded-bits: '0' is not a number from 1 to 16777216; see 'quarzel vectors --help'");
    expectRefused({"--transport-block", "7000", "--coded-bits", "3", "--modulation", "qpsk"},
                  "--coded-bits: the code blocks need at least 4 coded bits, not 3; choose a size that fits");
    expectRefused(
        {"--coded-bits", "101", "--modulation", "16qam"},
        "--coded-bits: coded bits must be a multiple of 4, not 101; the nearest: 100, 104; choose a "
        "size that fits");
    expectRefused({"--coded-bits", "2113"},
                  "--coded-bits: a code block of 40 bits is sent as at most 2112 coded bits here, not 2113; "
                  "choose a size that fits");
    expectRefused({"--block-size", "41", "--code-rate", "0.5"},
                  "--block-size: 41 is not a block size of LTE; the nearest: 40, 48");
    expectRefused({"--code-rate", "1e-9"},
                  "--code-rate: a code block of 40 bits is sent as at most 2112 coded bits here, not "
                  "16777216; choose a size that fits");
}

TEST_F(LinkVectors, AreRefusedForOptionsThatDoNotGoTogether) {
    expectRefused({"--rv", "0,4"}, "--rv: '4' is not 0, 1, 2 or 3; see 'quarzel vectors --help'");
    expectRefused(
        {"--transport-block", "40", "--coded-bits", "60", "--block-size", "40"},
        "--block-size: does not go with --transport-block, which is cut into code blocks; leave it out");
    expectRefused({"--coded-bits", "60", "--code-rate", "0.5"},
                  "--code-rate: does not go with --coded-bits; leave one of them out");
    expectRefused({"--coded-bits", "60,64"},
                  "--coded-bits: names several values; the link of a set has one; make a set for each");
    expectRefused({"--block-size", "40,48", "--code-rate", "0.5"},
                  "--block-size: names several values; the link of a set has one; make a set for each");
    expectRefused({"--harq", "2", "--stimulus", "ties"},
                  "--stimulus: does not go with --harq: the blocks of a link are noise; leave it out");
    expectRefused({"--cover-sizes", "--rv", "2"},
                  "--rv: does not go with --cover-sizes, which takes all; leave it out");
}

}  // namespace quarzel::test
