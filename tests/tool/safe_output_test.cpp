// SPDX-License-Identifier: MIT
// Outputs that are there and those of others are never lost.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <optional>
#include <system_error>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "small_disk.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

namespace fs = std::filesystem;

/// A sweep that would take hours.
std::vector<std::string> longSweepTo(const std::string& output) {
    return {"sweep", "--ebn0", "9", "--max-blocks", "1e12", "--max-block-errors", "0", "-o", output};
}

void expectRefusedAtOnce(const std::string& output, const std::string& problem) {
    const ToolRun run = runTool(longSweepTo(output));
    EXPECT_EQ(run.err, "quarzel: error: " + output + ": cannot be written: " + problem + '\n');
    EXPECT_EQ(run.exitCode, 3);
}

ToolRun runScript(const std::string& script, const std::vector<std::string>& arguments) {
    std::vector<std::string> words = {"-c", script, QUARZEL_TOOL};
    words.insert(words.end(), arguments.begin(), arguments.end());
    return runTool(words, {.program = "/bin/sh"});
}

/// Run the tool as a user without rights.
ToolRun runAsNobody(const std::vector<std::string>& arguments) {
    std::vector<std::string> words = {"--reuid=65534", "--regid=65534", "--clear-groups", QUARZEL_TOOL};
    words.insert(words.end(), arguments.begin(), arguments.end());
    return runTool(words, {.program = "/usr/bin/setpriv"});
}

bool mayBecomeNobody() {
    return ::geteuid() == 0 && runAsNobody({"--version"}).exitCode == 0;
}

}  // namespace

TEST(SafeOutput, KeepsTheModeOfTheFileThatItReplaces) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("out.npy", "old");
    for (const mode_t mode : {0600U, 0664U}) {
        fs::permissions(file, static_cast<fs::perms>(mode));
        EXPECT_EQ(runTool({"decode", shipped("k40.soft.npy"), "-o", file}).exitCode, 0);
        EXPECT_EQ(fs::status(file).permissions(), static_cast<fs::perms>(mode));
        EXPECT_EQ(readFile(file), readFile(shipped("k40.decided.npy")));
    }
}

TEST(SafeOutput, GoesWhereALinkLeadsThoughNothingIsThereYet) {
    const TemporaryDirectory directory;
    fs::create_directory(directory.path("elsewhere"));
    fs::create_symlink("elsewhere/middle.npy", directory.path("link.npy"));
    fs::create_symlink("out.npy", directory.path("elsewhere/middle.npy"));
    EXPECT_EQ(runTool({"decode", shipped("k40.soft.npy"), "-o", directory.path("link.npy")}).exitCode, 0);
    EXPECT_TRUE(fs::is_symlink(directory.path("link.npy")));
    EXPECT_EQ(readFile(directory.path("elsewhere/out.npy")), readFile(shipped("k40.decided.npy")));
}

TEST(SafeOutput, IsRefusedWhenItsLinksGoRound) {
    const TemporaryDirectory directory;
    fs::create_symlink("b", directory.path("a"));
    fs::create_symlink("a", directory.path("b"));
    expectRefusedAtOnce(directory.path("a"), "Too many levels of symbolic links; choose another place");
}

TEST(SafeOutput, IsRefusedBeforeTheWorkWhenItsNameIsTooLong) {
    const TemporaryDirectory directory;
    expectRefusedAtOnce(directory.path(std::string(256, 'x')), "File name too long; choose a shorter name");
    const std::string shorter = directory.path(std::string(255, 'x'));
    const ToolRun run = runTool(longSweepTo(shorter));
    EXPECT_THAT(run.err, testing::StartsWith("quarzel: error: " + shorter + ".checkpoint"));
    EXPECT_THAT(run.err,
                testing::EndsWith(": cannot be written: File name too long; choose a shorter name\n"));
    EXPECT_TRUE(directory.names().empty());
}

TEST(SafeOutput, IsRefusedBeforeTheWorkWhenItIsAMountPoint) {
    std::optional<SmallDisk> disk;
    try {
        disk.emplace(256);
    } catch (const std::system_error& error) {
        GTEST_SKIP() << "no small disk can be mounted (superusers may): " << error.what();
    }
    const std::string file = disk->write("result.json", "precious");
    ASSERT_EQ(::mount(file.c_str(), file.c_str(), nullptr, MS_BIND, nullptr), 0);
    expectRefusedAtOnce(file, "Device or resource busy; choose another place");
    ::umount2(file.c_str(), MNT_DETACH);
    EXPECT_EQ(readFile(file), "precious");
    const std::string set = disk->path("set");
    fs::create_directory(set);
    ASSERT_EQ(::mount(set.c_str(), set.c_str(), nullptr, MS_BIND, nullptr), 0);
    EXPECT_EQ(
        runTool({"vectors", set}).err,
        "quarzel: error: " + set + ": cannot be written: Device or resource busy; choose another place\n");
    ::umount2(set.c_str(), MNT_DETACH);
    EXPECT_THAT(disk->names(), testing::ElementsAre("result.json", "set"));
}

TEST(SafeOutput, IsRefusedBeforeTheWorkWhenItIsAnothersInAStickyDirectory) {
    if (!mayBecomeNobody()) {
        GTEST_SKIP() << "only the superuser can become another user";
    }
    const TemporaryDirectory directory;
    const std::string file = directory.write("result.json", "precious");
    ASSERT_EQ(::chmod(file.c_str(), 0666), 0);
    ASSERT_EQ(::chmod(directory.path("").c_str(), 01777), 0);
    const ToolRun run = runAsNobody(longSweepTo(file));
    EXPECT_EQ(run.err,
              "quarzel: error: " + file +
                  ": cannot be written: Operation not permitted; choose a place that you may write to\n");
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_EQ(readFile(file), "precious");
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json"));
}

// Something is in the way when the result is to take its place.
TEST(SafeOutput, LeavesTheCheckpointWhenTheResultCannotTakeItsPlace) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const ToolRun run = runScript(R"("$0" sweep --ebn0 8 --max-blocks 1e12 --max-block-errors 0 \
                                         --max-time 1 --block-size 40 -o "$1" --checkpoint-every 0 &
                                     until [ -e "$1.checkpoint" ]; do sleep 0.01; done
                                     mkdir "$1"
                                     wait $!)",
                                  {file});
    EXPECT_THAT(run.err, testing::EndsWith("quarzel: error: " + file +
                                           ": cannot be written: Is a directory; choose another place; the "
                                           "sweep is done: --resume then writes it at once\n"));
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_THAT(run.out, testing::HasSubstr("\n      8 ")) << "the table is printed nonetheless";
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json", "result.json.checkpoint"));
    fs::remove(file);
    const ToolRun resumed = runTool({"sweep", "--ebn0", "8", "--max-blocks", "1e12", "--max-block-errors",
                                     "0", "--max-time", "1", "--block-size", "40", "-o", file, "--resume"});
    EXPECT_EQ(resumed.exitCode, 0) << resumed.err;
    EXPECT_EQ(resumed.out, run.out);
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json"));
}

// After a loss of power one of the two is there: the name of the result is on the disk before that of the
// checkpoint goes.
TEST(SafeOutput, IsOnTheDiskBeforeItsCheckpointGoes) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const std::string calls = directory.path("calls");
    const ToolRun run = runTool({"-f", "-e", "trace=/^(rename|unlink|fsync)", "-o", calls, QUARZEL_TOOL,
                                 "sweep", "--ebn0", "9", "--max-blocks", "8", "-o", file},
                                {.program = "/usr/bin/strace"});
    if (run.exitCode != 0) {
        GTEST_SKIP() << "system calls cannot be watched here";
    }
    const std::string text = readFile(calls);
    const std::size_t renamed = text.find("\"" + file + "\")");
    const std::size_t synced = text.find("fsync(", renamed);
    const std::size_t removed = text.find("\"" + file + ".checkpoint\"", text.find("unlink", synced));
    ASSERT_NE(removed, std::string::npos) << text;
    EXPECT_LT(renamed, synced);
    EXPECT_LT(synced, removed);
}

TEST(SafeOutput, LeavesTheCheckpointWhenStandardOutputIsFull) {
    const TemporaryDirectory directory;
    const std::string checkpoint = directory.path("kept");
    const std::vector<std::string> sweep = {
        "sweep",    "--ebn0",       "8",  "--max-blocks",       "1e5", "--checkpoint",
        checkpoint, "--block-size", "40", "--checkpoint-every", "0"};
    const ToolRun run = runTool(sweep, {.standardOutput = "/dev/full"});
    EXPECT_EQ(run.exitCode, 3);
    ASSERT_THAT(directory.names(), testing::ElementsAre("kept"));
    std::vector<std::string> resumed = sweep;
    resumed.push_back("--resume");
    EXPECT_EQ(runTool(resumed).exitCode, 0);
    EXPECT_TRUE(directory.names().empty());
}

TEST(SafeOutput, ThatIsADeviceHasNoCheckpointBesideIt) {
    const ToolRun run = runTool({"sweep", "--ebn0", "9", "--max-blocks", "10", "-o", "/dev/full"});
    EXPECT_THAT(run.err, testing::EndsWith("free some space; the sweep then begins anew\n"));
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_FALSE(fs::exists("/dev/full.checkpoint"));
    EXPECT_FALSE(fs::exists("/dev/full.checkpoint.lock"));
}

TEST(SafeOutput, IsLockedWhileItsSweepRuns) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const ToolRun run = runScript(R"("$0" sweep --ebn0 8 --max-blocks 1e12 --max-block-errors 0 \
                                         --max-time 6 --block-size 40 -o "$1" --checkpoint-every 0 &
                                     until [ -e "$1.checkpoint" ]; do sleep 0.01; done
                                     "$0" sweep --ebn0 8 --max-blocks 8 -o "$1"
                                     [ $? = 3 ] || echo no refusal
                                     "$0" sweep --ebn0 8 --max-blocks 8 -o "$1" --resume
                                     [ $? = 3 ] || echo no refusal
                                     [ -e "$1.checkpoint" ] || echo the checkpoint is gone
                                     echo "holder $!"
                                     wait $!)",
                                  {file});
    const std::size_t at = run.out.find("holder ") + 7;
    const std::string holder = run.out.substr(at, run.out.find('\n', at) - at);
    EXPECT_THAT(run.out, testing::StartsWith("holder "));
    EXPECT_EQ(run.exitCode, 0);
    const std::string refusal = "quarzel: error: " + file + ".checkpoint: is in use by process " + holder +
                                " on [^\n]*; wait for "
                                "its end, or give another name\n";
    EXPECT_THAT(run.err, testing::MatchesRegex(refusal + refusal + "quarzel: K 40,[^\n]*\n"));
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json"));
}

TEST(SafeOutput, IsLockedForAllCommandsThatExtendIt) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const ToolRun run = runScript(R"("$0" threshold --block-size 6144 --target-bler 1e-6 -o "$1" 2>/dev/null &
                                     holder=$!
                                     until [ -s "$1.lock" ]; do sleep 0.01; done
                                     refused() {
                                       "$0" "$@"
                                       [ $? = 3 ] || echo no refusal
                                     }
                                     refused threshold --block-size 40 -o "$1" &
                                     first=$!
                                     refused merge "$2" -o "$1" &
                                     second=$!
                                     refused sweep --ebn0 8 --max-blocks 8 -o "$1" --checkpoint "$1.mine"
                                     wait $first $second
                                     kill $holder
                                     wait $holder)",
                                  {file, QUARZEL_TEST_DATA "/../sweep/data/small_sweep.json"});
    EXPECT_EQ(run.out, "");
    const std::string refusal =
        "quarzel: error: " + file +
        ": is in use by process [0-9]* on [^\n]*; wait for its end, or give another name\n";
    EXPECT_THAT(run.err, testing::MatchesRegex(refusal + refusal + refusal));
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json")) << "what the search has done";
}

TEST(SafeOutput, IsNotLockedByASweepThatWasKilled) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    runScript(R"("$0" sweep --ebn0 8 --max-blocks 1e12 --max-block-errors 0 -o "$1" &
                 until [ -s "$1.checkpoint.lock" ]; do sleep 0.01; done
                 kill -s KILL $!)",
              {file});
    ASSERT_THAT(directory.names(), testing::Contains("result.json.checkpoint.lock"));
    EXPECT_EQ(runTool({"sweep", "--ebn0", "8", "--max-blocks", "8", "-o", file}).exitCode, 0);
    EXPECT_THAT(directory.names(), testing::ElementsAre("result.json"));
}

TEST(SafeOutput, LeavesAFileAloneThatHasTheNameOfALock) {
    const TemporaryDirectory directory;
    const std::string lock = directory.write("result.json.checkpoint.lock", "precious");
    const ToolRun run =
        runTool({"sweep", "--ebn0", "8", "--max-blocks", "8", "-o", directory.path("result.json")});
    EXPECT_EQ(run.err, "quarzel: error: " + lock + ": is not a lock of quarzel; move it away\n");
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_EQ(readFile(lock), "precious");
}

// In containers several processes have the same number.
TEST(SafeOutput, IsMadeBesideThatOfAProcessOfTheSameNumber) {
    if (runTool({"-pf", "true"}, {.program = "/usr/bin/unshare"}).exitCode != 0) {
        GTEST_SKIP() << "only superusers can make a name space of processes";
    }
    const TemporaryDirectory directory;
    const ToolRun run = runScript(R"(cd "$1"
                                     for i in 1 2 3 4; do
                                       unshare -pf "$0" vectors "set$i" --blocks 200 --block-size 6144 \
                                           --seed "$i" --json &
                                       unshare -pf "$0" sweep --ebn0 8 --max-blocks 200 --block-size 6144 \
                                           --checkpoint-every 0 --csv -o "result$i" &
                                     done
                                     wait)",
                                  {directory.path("")});
    EXPECT_THAT(run.err, testing::Not(testing::HasSubstr("error:")));
    EXPECT_THAT(directory.names(), testing::ElementsAre("result1", "result2", "result3", "result4", "set1",
                                                        "set2", "set3", "set4"));
    for (const char* set : {"set1", "set2", "set3", "set4"}) {
        const std::string core = directory.path(set) + "/u2_a1";
        EXPECT_EQ(runTool({"compare", core, core + "/dout.hex"}).exitCode, 0);
    }
}

TEST(SafeOutput, IsMadeThoughAnEarlierRunWasKilled) {
    const TemporaryDirectory directory;
    const std::string set = directory.path("set");
    runScript(R"sh("$0" vectors "$1" --block-size 6144 --blocks 100000 &
                 until [ -n "$(ls -A "$2")" ]; do sleep 0.01; done
                 kill -s KILL $!)sh",
              {set, directory.path("")});
    ASSERT_EQ(directory.names().size(), 1U) << "what the killed run has begun";
    EXPECT_EQ(runTool({"vectors", set}).exitCode, 0);
    EXPECT_THAT(directory.names(), testing::Contains("set"));
}

}  // namespace quarzel::test
