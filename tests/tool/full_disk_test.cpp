// SPDX-License-Identifier: MIT
// A disk without room: one clear line, nothing half-written, and all is well once there is room.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <optional>
#include <system_error>

#include "run_tool.hpp"
#include "small_disk.hpp"
#include "sweep/sweeps.hpp"

namespace quarzel::test {

namespace {

class FullDisk : public testing::Test {
  protected:
    void SetUp() override {
        try {
            itsDisk.emplace(256);
        } catch (const std::system_error& error) {
            GTEST_SKIP() << "no small disk can be mounted (superusers may): " << error.what();
        }
    }

    /// Run the command without room, which fails, and with room, which does not.
    void expectOneLineAndThenDone(const std::vector<std::string>& arguments, const std::string& output,
                                  const std::string& named) {
        itsDisk->fill();
        const std::vector<std::string> before = itsDisk->names();
        const ToolRun full = runTool(arguments);
        EXPECT_EQ(full.err, "quarzel: error: " + itsDisk->path(named) +
                                ": cannot be written: No space left on device; free some space\n");
        EXPECT_EQ(full.out, "");
        EXPECT_EQ(full.exitCode, 3);
        EXPECT_EQ(itsDisk->names(), before) << "nothing may be left";
        itsDisk->makeRoom();
        const ToolRun run = runTool(arguments);
        EXPECT_EQ(run.err, "");
        EXPECT_EQ(run.exitCode, 0);
        EXPECT_THAT(itsDisk->names(), testing::Contains(output));
    }

    std::optional<SmallDisk> itsDisk;
};

}  // namespace

TEST_F(FullDisk, LeavesASweepItsOlderCheckpoint) {
    const std::string file = itsDisk->path("result.json");
    const sweep::Result whole = resultOf(smallSweep());
    const sweep::Result half{7, {whole.points.begin(), std::next(whole.points.begin(), 6)}, {}};
    const std::string checkpoint = itsDisk->write("result.json.checkpoint", sweep::resultText(half));
    const std::vector<std::string> arguments = {
        "sweep",   "--block-size", "40,104", "--algorithm",  "0,2", "--iterations",       "3",  "--ebn0",
        "0:1.5:3", "--seed",       "7",      "--max-blocks", "301", "--max-block-errors", "50", "-o",
        file,      "--resume"};

    itsDisk->fill();
    const ToolRun full = runTool(arguments);
    EXPECT_EQ(full.err, "quarzel: warning: the checkpoint could not be renewed: " + checkpoint +
                            ": cannot be written: No space left on device; free some space\n"
                            "quarzel: error: " +
                            file +
                            ": cannot be written: No space left on device; free some space; --resume then "
                            "goes on from what was kept\n");
    EXPECT_EQ(full.exitCode, 3);
    EXPECT_THAT(itsDisk->names(), testing::ElementsAre("ballast", "result.json.checkpoint"));
    EXPECT_EQ(readFile(checkpoint), sweep::resultText(half));

    itsDisk->makeRoom();
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.exitCode, 0);
    EXPECT_EQ(run.out, full.out) << "the table was printed nonetheless";
    EXPECT_THAT(itsDisk->names(), testing::ElementsAre("result.json"));
    EXPECT_EQ(readFile(file), sweep::resultText(whole));
}

TEST_F(FullDisk, LeavesNothingOfASweepThatKeptNothing) {
    itsDisk->fill();
    const ToolRun run = runTool({"sweep", "--block-size", "40", "--ebn0", "20", "--max-blocks", "9", "--json",
                                 "-o", itsDisk->path("result.json")});
    EXPECT_THAT(run.err, testing::EndsWith("free some space; the sweep then begins anew\n"));
    EXPECT_EQ(sweep::readResult(run.out).points.begin()->second.blocks, 9U)
        << "the result is printed nonetheless";
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_THAT(itsDisk->names(), testing::ElementsAre("ballast"));
}

TEST_F(FullDisk, KeepsAMergedResultAway) {
    std::vector<std::string> arguments = {"merge"};
    for (const std::uint64_t index : {0U, 1U}) {
        arguments.push_back(itsDisk->write("part" + std::to_string(index),
                                           sweep::resultText(partResult(smallSweep(), {index, 2}).result)));
    }
    arguments.insert(arguments.end(), {"-o", itsDisk->path("merged.json")});
    expectOneLineAndThenDone(arguments, "merged.json", "merged.json");
    EXPECT_EQ(readFile(itsDisk->path("merged.json")), sweep::resultText(resultOf(smallSweep())));
}

TEST_F(FullDisk, KeepsAPictureAway) {
    const std::string result = itsDisk->write("result.json", sweep::resultText(resultOf(smallSweep())));
    expectOneLineAndThenDone({"plot", result, "-o", itsDisk->path("curves.svg")}, "curves.svg", "curves.svg");
}

TEST_F(FullDisk, KeepsAVectorSetAway) {
    expectOneLineAndThenDone({"vectors", itsDisk->path("set"), "--blocks", "2"}, "set",
                             "set/u2_a1/config.vh");
}

TEST_F(FullDisk, KeepsDecisionsAway) {
    expectOneLineAndThenDone({"decode", QUARZEL_CAPTURES "/k40.soft.npy", "-o", itsDisk->path("out.npy")},
                             "out.npy", "out.npy");
}

}  // namespace quarzel::test
