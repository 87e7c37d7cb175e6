// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <map>

#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace fs = std::filesystem;

namespace quarzel::test {

namespace {

/// `quarzel sweep --keep-failures`, with two sizes and a point without errors.
class KeepFailures : public testing::Test {
  protected:
    ToolRun sweep(const std::vector<std::string>& more, const std::string& name = "r.json") {
        std::vector<std::string> arguments = {
            "sweep",  "--block-size", "40,48", "--iterations",         "3", "--seed", "7", "--algorithm", "0",
            "--ebn0", "1,20",         "-o",    itsDirectory.path(name)};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return runTool(arguments);
    }

    std::map<std::string, std::string> folder(const std::string& name = "r.json") const {
        std::map<std::string, std::string> files;
        for (const auto& entry : fs::directory_iterator(itsDirectory.path(name + ".failures"))) {
            files[entry.path().filename().string()] = readFile(entry.path().string());
        }
        return files;
    }

    TemporaryDirectory itsDirectory;
    const std::vector<std::string> itsUsual = {"--max-blocks",    "301", "--max-block-errors", "20",
                                               "--keep-failures", "3"};
};

}  // namespace

TEST_F(KeepFailures, WritesCapturesThatFailAgain) {
    ASSERT_EQ(sweep(itsUsual).exitCode, 0);
    const auto files = folder();
    std::vector<std::string> names;
    for (const auto& [name, bytes] : files) {
        names.push_back(name);
    }
    EXPECT_THAT(names, testing::ElementsAre("failures.csv", "k40_u2_a0_i3.sent.npy", "k40_u2_a0_i3.soft.npy",
                                            "k48_u2_a0_i3.sent.npy", "k48_u2_a0_i3.soft.npy"));
    const std::string number = "[0-9]+";
    std::string rows =
        "capture,row,seed,point,number,code_block,bit_errors,block_size,units,algorithm,iterations,quantiser,"
        "scale,ebn0_db,sending\n";
    for (const auto& [K, point] : {std::pair{"40", "0"}, std::pair{"48", "2"}}) {
        for (const char* const row : {"0", "1", "2"}) {
            rows += std::string("k") + K + "_u2_a0_i3\\.soft\\.npy," + row + ",7," + point + "," + number +
                    ",0," + number + "," + K + ",2,0,3,llr,4,1,\n";
        }
    }
    EXPECT_THAT(files.at("failures.csv"), testing::MatchesRegex(rows));
    const std::string capture = itsDirectory.path("r.json.failures/k48_u2_a0_i3");
    const ToolRun run = runTool({"decode", capture + ".soft.npy", "--units", "2", "--algorithm", "0",
                                 "--iterations", "3", "--reference", capture + ".sent.npy"});
    EXPECT_THAT(run.out, testing::HasSubstr("wrong blocks  0, 1, 2, counted from 0\n")) << run.err;
}

TEST_F(KeepFailures, DependsOnTheResultAlone) {
    std::vector<std::string> more = itsUsual;
    ASSERT_EQ(sweep(more).exitCode, 0);
    const auto files = folder();
    more.insert(more.end(), {"--threads", "3"});
    ASSERT_EQ(sweep(more, "threads.json").exitCode, 0);
    EXPECT_EQ(folder("threads.json"), files);
    ASSERT_EQ(sweep(more, "threads.json").exitCode, 0) << "looks for them again";
    EXPECT_EQ(folder("threads.json"), files);

    ASSERT_EQ(sweep({"--max-blocks", "30"}, "extended.json").exitCode, 0);
    ASSERT_EQ(sweep(itsUsual, "extended.json").exitCode, 0);
    EXPECT_EQ(folder("extended.json"), files);
}

TEST_F(KeepFailures, OfTransportBlocksKeepsTheirCodeBlocks) {
    const ToolRun run = runTool({"sweep", "--transport-block", "6200", "--code-rate", "1/2", "--modulation",
                                 "qpsk", "--iterations", "2", "--ebn0=-2", "--max-blocks", "5", "--rv", "0,2",
                                 "-o", itsDirectory.path("r.json"), "--keep-failures", "1"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const std::string list = folder().at("failures.csv");
    EXPECT_THAT(list, testing::HasSubstr(",1,0,0,1,"));
    EXPECT_THAT(list,
                testing::HasSubstr(",\"transport blocks of 6200 bits, 12400 coded bits, qpsk, rv 0 2\"\n"));
}

TEST_F(KeepFailures, WithoutErrorsListsNone) {
    ASSERT_EQ(runTool({"sweep", "--block-size", "40", "--ebn0", "20", "--max-blocks", "8", "-o",
                       itsDirectory.path("r.json"), "--keep-failures", "1"})
                  .exitCode,
              0);
    const auto files = folder();
    EXPECT_EQ(files.size(), 1U);
    EXPECT_TRUE(files.at("failures.csv").ends_with(",sending\n"));
}

TEST_F(KeepFailures, RefusesWhatCannotBe) {
    const auto refusal = [](std::vector<std::string> options) {
        options.insert(options.begin(), {"sweep", "--ebn0", "1", "--max-blocks", "1", "--keep-failures"});
        return runTool(options);
    };
    const ToolRun none = refusal({"3"});
    EXPECT_EQ(
        none.err,
        "quarzel: error: --keep-failures: there is no result to keep them beside; name a file with -o\n");
    EXPECT_EQ(none.exitCode, 2);
    EXPECT_EQ(refusal({"3", "-o", "-"}).err, none.err);
    EXPECT_EQ(
        refusal({"0"}).err,
        "quarzel: error: --keep-failures: '0' is not a number from 1 to 1000; see 'quarzel sweep --help'\n");
    itsDirectory.write("r.json.failures", "in the way");
    const ToolRun taken = refusal({"3", "-o", itsDirectory.path("r.json")});
    EXPECT_EQ(taken.err, "quarzel: error: " + itsDirectory.path("r.json.failures") +
                             ": is not a directory; remove it, or name another output with -o\n");
    EXPECT_EQ(taken.exitCode, 3);
    EXPECT_THAT(itsDirectory.names(), testing::ElementsAre("r.json.failures")) << "before any work";
}

}  // namespace quarzel::test
