// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <map>
#include <nlohmann/json.hpp>
#include <sstream>

#include "golden.hpp"
#include "npy_data.hpp"
#include "quarzel/core.hpp"
#include "run_tool.hpp"
#include "sweep/sha256.hpp"
#include "temporary_directory.hpp"
#include "vectors/covering_blocks.hpp"
#include "vectors/memory_image.hpp"

namespace fs = std::filesystem;

namespace quarzel::test {

namespace {

/// Every file below a directory, by name.
std::map<std::string, std::string> filesIn(const std::string& directory) {
    std::map<std::string, std::string> files;
    for (const auto& entry : fs::recursive_directory_iterator(directory)) {
        if (entry.is_regular_file()) {
            files[entry.path().lexically_relative(directory).string()] = readFile(entry.path().string());
        }
    }
    return files;
}

class VectorsCommand : public testing::Test {
  protected:
    ToolRun make(std::vector<std::string> options, const std::string& name = "set") {
        options.insert(options.begin(), {"vectors", itsDirectory.path(name)});
        return runTool(options);
    }

    /// The words of a memory, which must have a word at each of its first addresses and no more.
    std::vector<std::uint32_t> memory(const std::string& file, std::size_t size) {
        std::ifstream stream(itsDirectory.path(file));
        const tool::MemoryImage image = tool::readMemoryText(stream, size, file);
        EXPECT_EQ(image.beyond, 0U) << file;
        std::vector<std::uint32_t> words;
        for (const tool::MemoryWord& word : image.words) {
            EXPECT_EQ(word.kind, tool::MemoryWord::Kind::known) << file;
            words.push_back(word.value);
        }
        return words;
    }

    nlohmann::json manifest(const std::string& name = "set") {
        return nlohmann::json::parse(readFile(itsDirectory.path(name + "/manifest.json")));
    }

    TemporaryDirectory itsDirectory;
};

}  // namespace

TEST_F(VectorsCommand, TellsWhatItMade) {
    const ToolRun run = make({"--block-size", "40,48", "--blocks", "3"});
    EXPECT_EQ(run.out, "directory     " + itsDirectory.path("set") +
                           "\n"
                           "cores         1\n"
                           "blocks        6\n"
                           "bits          264\n"
                           "files         12, 0.0 MB\n");
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
    const nlohmann::json json = nlohmann::json::parse(make({"--json"}, "other").out);
    EXPECT_EQ(json.at("blocks"), 10);
    EXPECT_EQ(json.at("bits"), 400);
}

TEST_F(VectorsCommand, GivesTheSameBytesWhateverTheNumberOfThreads) {
    const std::vector<std::string> options = {
        "--block-size", "40,1024", "--units", "2,8",        "--algorithm",
        "0,2",          "--seed",  "77",      "--stimulus", "noise,saturating,last-segment"};
    std::map<std::string, std::string> first;
    for (const char* const threads : {"1", "2", "7"}) {
        std::vector<std::string> all = options;
        all.insert(all.end(), {"--threads", threads});
        ASSERT_EQ(make(all, threads).exitCode, 0);
        const std::map<std::string, std::string> files = filesIn(itsDirectory.path(threads));
        EXPECT_EQ(files.size(), 4U * 10 + 2);
        first = first.empty() ? files : first;
        EXPECT_TRUE(files == first) << threads << " threads";
    }
    make({"--block-size", "40,1024", "--units", "2,8", "--algorithm", "0,2", "--seed", "78"}, "other");
    EXPECT_NE(readFile(itsDirectory.path("other/u2_a0/dout.hex")), first.at("u2_a0/dout.hex"));
}

TEST_F(VectorsCommand, HoldsTheSameBlocksInMemoriesAndCaptures) {
    ASSERT_EQ(make({"--block-size", "40,512", "--iterations", "3,1", "--blocks", "4", "--units", "4",
                    "--algorithm", "2", "--ebn0", "0.5"})
                  .exitCode,
              0);
    const std::size_t blocks = 16;
    const std::size_t bits = 8 * (40 + 512);
    const std::size_t values = bits + 4 * blocks;
    const std::string header = readFile(itsDirectory.path("set/u4_a2/config.vh"));
    for (const std::string& line :
         {std::string("UNITS = 4"), std::string("ALGORITHM = 2"), "BLOCKS = " + std::to_string(blocks),
          "SOFT_WORDS = " + std::to_string(values), "DOUT_WORDS = " + std::to_string(bits),
          std::string("MAX_K = 512")}) {
        EXPECT_NE(header.find("localparam " + line + ";"), std::string::npos) << header;
    }
    const std::vector<std::uint32_t> table = memory("set/u4_a2/blocks.hex", 4 * blocks);
    const std::vector<std::uint32_t> dout = memory("set/u4_a2/dout.hex", bits);
    const std::vector<std::vector<std::uint32_t>> streams = {memory("set/u4_a2/rsc1_sys.hex", values),
                                                             memory("set/u4_a2/rsc1_par.hex", values),
                                                             memory("set/u4_a2/rsc2_par.hex", values)};
    const nlohmann::json rows = manifest().at("cores").at(0).at("blocks");
    ASSERT_EQ(rows.size(), blocks);
    for (std::size_t block = 0; block < blocks; ++block) {
        const nlohmann::json& row = rows.at(block);
        const std::size_t K = table[4 * block];
        EXPECT_EQ(row.at("block_size"), K);
        EXPECT_EQ(row.at("iterations"), table[4 * block + 1]);
        const std::string capture = itsDirectory.path("set/u4_a2/" + row.at("capture").get<std::string>());
        const auto soft = xt::load_npy<std::int8_t>(capture);
        const auto decided =
            xt::load_npy<std::uint8_t>(capture.substr(0, capture.size() - 9) + ".decided.npy");
        const std::size_t at = row.at("row");
        for (std::size_t i = 0; i < 3 * (K + 4); ++i) {
            const std::size_t stream = i / (K + 4);
            const std::uint32_t word = streams[stream][table[4 * block + 2] + i % (K + 4)];
            ASSERT_EQ(static_cast<std::int8_t>(word), soft(at, stream, i % (K + 4)));
        }
        for (std::size_t i = 0; i < K; ++i) {
            ASSERT_EQ(dout[table[4 * block + 3] + i], decided(at, i / 8) >> (7 - i % 8) & 1);
        }
    }
}

TEST_F(VectorsCommand, ExpectsWhatDecodeDecides) {
    ASSERT_EQ(make({"--block-size", "1024", "--iterations", "2", "--blocks", "5", "--stimulus",
                    "noise,ties,saturating", "--units", "8", "--algorithm", "0"})
                  .exitCode,
              0);
    const std::string capture = itsDirectory.path("set/u8_a0/npy/k1024_i2");
    const ToolRun run = runTool({"decode", capture + ".soft.npy", "--units", "8", "--algorithm", "0",
                                 "--iterations", "2", "--reference", capture + ".decided.npy", "--json"});
    const nlohmann::json report = nlohmann::json::parse(run.out);
    EXPECT_EQ(report.at("blocks"), 15);
    EXPECT_EQ(report.at("bit_errors"), 0);
}

TEST_F(VectorsCommand, TellsSizeAndDigestOfEveryFile) {
    ASSERT_EQ(make({"--units", "2,4"}).exitCode, 0);
    std::map<std::string, std::string> files = filesIn(itsDirectory.path("set"));
    files.erase("manifest.json");
    const nlohmann::json set = manifest();
    for (const nlohmann::json& entry : set.at("files")) {
        const std::string name = entry.at("name");
        ASSERT_EQ(files.count(name), 1U) << name;
        EXPECT_EQ(entry.at("bytes"), files[name].size());
        EXPECT_EQ(entry.at("sha256"), sweep::sha256(files[name]));
        files.erase(name);
    }
    EXPECT_TRUE(files.empty()) << files.begin()->first << " is not in the manifest";
}

TEST_F(VectorsCommand, IsMadeAgainByTheCommandInItsManifest) {
    ASSERT_EQ(make({"--block-size", "48,40,48", "--stimulus", "ties,noise", "--ebn0", "-0.35", "--scale",
                    "7.5", "--seed", "18446744073709551615", "--iterations", "15,2"})
                  .exitCode,
              0);
    std::istringstream words(manifest().at("configuration").at("command").get<std::string>());
    std::vector<std::string> arguments{std::istream_iterator<std::string>(words), {}};
    ASSERT_EQ(arguments.at(0), "quarzel");
    ASSERT_EQ(arguments.at(2), "DIRECTORY");
    arguments.erase(arguments.begin());
    arguments[1] = itsDirectory.path("again");
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.exitCode, 0) << run.err;
    EXPECT_TRUE(filesIn(itsDirectory.path("again")) == filesIn(itsDirectory.path("set")));
}

TEST_F(VectorsCommand, CoversEverySizeWindowShapeSegmentAndSaturation) {
    const ToolRun run = make({"--cover-sizes", "--units", "4", "--algorithm", "1"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const nlohmann::json set = manifest();
    const nlohmann::json& coverage = set.at("coverage").at("u4_a1");
    EXPECT_EQ(coverage.at("block_sizes").at("reached"), 188);
    EXPECT_EQ(coverage.at("window_shapes").at("reached"), coverage.at("window_shapes").at("of"));
    EXPECT_EQ(coverage.at("blocks_by_iterations").size(), 15U);
    EXPECT_EQ(coverage.at("blocks_by_stimulus").size(), 7U);
    for (const auto& [segment, corrections] : coverage.at("corrections_by_segment").items()) {
        EXPECT_GT(corrections, 0) << segment;
    }
    for (const auto& [stream, values] : coverage.at("values_by_stream").items()) {
        EXPECT_GT(values.at("-128"), 0) << stream;
        EXPECT_GT(values.at("127"), 0) << stream;
    }
    // All of it once more, from the blocks themselves.
    std::map<std::string, std::size_t> stimuli;
    std::size_t blocks = 0;
    for (const nlohmann::json& block : set.at("cores").at(0).at("blocks")) {
        ++stimuli[block.at("stimulus")];
        ++blocks;
    }
    EXPECT_EQ(stimuli.at("noise"), 188U);
    for (const auto& [name, count] : stimuli) {
        EXPECT_EQ(coverage.at("blocks_by_stimulus").at(name), count);
    }
    const std::vector<std::uint32_t> table = memory("set/u4_a1/blocks.hex", 4 * blocks);
    const std::size_t values = table[4 * blocks - 2] + table[4 * blocks - 4] + 4;
    const std::vector<std::uint32_t> parity = memory("set/u4_a1/rsc2_par.hex", values);
    EXPECT_EQ(coverage.at("values_by_stream").at("rsc2_par").at("-128"),
              std::count(parity.begin(), parity.end(), 0x80U));
}

TEST_F(VectorsCommand, CoversTheFaultsOfACore) {
    ASSERT_EQ(make({"--cover", "--units", "4", "--algorithm", "2"}).exitCode, 0);
    const nlohmann::json set = manifest();
    EXPECT_EQ(set.at("configuration").dump(),
              R"({"algorithms":[2],"command":"quarzel vectors DIRECTORY --cover --units 4 --algorithm 2",)"
              R"("cover":"faults","units":[4]})");
    EXPECT_EQ(set.at("coverage").at("u4_a2").at("faults").dump(),
              R"({"catalogue":{"equivalent":6,"found":315,"of":315},"held_out":{"found":29,"of":29}})");
    const std::vector<tool::CoveringBlock> chosen = tool::coveringBlocks(4, 2);
    const nlohmann::json& blocks = set.at("cores").at(0).at("blocks");
    ASSERT_EQ(blocks.size(), chosen.size());
    const std::vector<std::uint32_t> tags = memory("set/u4_a2/tags.hex", chosen.size());
    Core core(CoreSettings{4, 2});
    for (std::size_t i = 0; i < chosen.size(); ++i) {
        const tool::PlannedBlock& planned = chosen[i].planned;
        EXPECT_EQ(blocks[i].at("block_size"), planned.blockSize);
        EXPECT_EQ(blocks[i].at("iterations"), planned.iterations);
        EXPECT_EQ(blocks[i].at("tag"), chosen[i].tag);
        EXPECT_EQ(tags[i], chosen[i].tag);
        // The captures hold the blocks of the table and what a core decides for them.
        const std::string capture =
            itsDirectory.path("set/u4_a2/" + blocks[i].at("capture").get<std::string>());
        const auto soft = xt::load_npy<std::int8_t>(capture);
        const auto decided =
            xt::load_npy<std::uint8_t>(capture.substr(0, capture.size() - 9) + ".decided.npy");
        const std::size_t row = blocks[i].at("row");
        const std::vector<std::int8_t> expected = tool::softValuesOf(chosen[i], 4);
        EXPECT_TRUE(std::equal(expected.begin(), expected.end(), &soft(row, 0, 0))) << i;
        std::vector<unsigned char> bits(planned.blockSize);
        core.decode(softBlocks(std::span(expected), planned.blockSize + tailPositions), planned.iterations,
                    bits);
        for (std::size_t bit = 0; bit < bits.size(); ++bit) {
            ASSERT_EQ(bits[bit], decided(row, bit / 8) >> (7 - bit % 8) & 1) << i << ' ' << bit;
        }
    }
}

// Any change of a block, of the stimuli or of a file's form shows here.
TEST_F(VectorsCommand, GivesACoveringSetByteForByte) {
    ASSERT_EQ(make({"--cover", "--units", "2", "--algorithm", "1"}).exitCode, 0);
    std::string digests;
    for (const auto& [name, bytes] : filesIn(itsDirectory.path("set/u2_a1"))) {
        digests += sweep::sha256(bytes) + "  " + name + '\n';
    }
    expectGolden(digests, "covering_set.txt");
}

TEST_F(VectorsCommand, CoversAllNineCoresWhereNoneIsNamed) {
    const ToolRun run = make({"--cover", "--json"});
    const nlohmann::json summary = nlohmann::json::parse(run.out);
    EXPECT_EQ(summary.at("cores"), 9);
    EXPECT_EQ(summary.at("blocks"), 94);
}

TEST_F(VectorsCommand, RefusesWhatDoesNotGoWithCover) {
    const auto expectRefused = [this](const std::vector<std::string>& options, const std::string& message) {
        const ToolRun run = make(options);
        EXPECT_EQ(run.err, "quarzel: error: " + message + "\n");
        EXPECT_EQ(run.exitCode, 2);
        EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{});
    };
    expectRefused({"--cover-sizes", "--block-size", "40"},
                  "--block-size: does not go with --cover-sizes, which takes all; leave it out");
    expectRefused({"--cover", "--cover-sizes"},
                  "--cover-sizes: does not go with --cover, whose blocks are chosen; leave it out");
    for (const auto& [option, value] : std::map<std::string, std::string>{{"--block-size", "40"},
                                                                          {"--stimulus", "ties"},
                                                                          {"--iterations", "3"},
                                                                          {"--blocks", "2"},
                                                                          {"--ebn0", "1"},
                                                                          {"--scale", "4"},
                                                                          {"--llr", "4"},
                                                                          {"--rv", "0"},
                                                                          {"--seed", "1"}}) {
        expectRefused({"--cover", option, value},
                      option + ": does not go with --cover, whose blocks are chosen; leave it out");
    }
}

}  // namespace quarzel::test
