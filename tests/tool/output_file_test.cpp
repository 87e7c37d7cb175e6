// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <future>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

namespace fs = std::filesystem;

ToolRun decodeTo(const std::string& output, const ToolSetting& setting = {}) {
    return runTool({"decode", shipped("k40.soft.npy"), "-o", output}, setting);
}

std::string decided() {
    return readFile(shipped("k40.decided.npy"));
}

void expectRefused(const std::string& output, const std::string& problem, const ToolSetting& setting = {}) {
    const ToolRun run = decodeTo(output, setting);
    EXPECT_EQ(run.err, "quarzel: error: " + output + ": " + problem + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 3);
}

}  // namespace

TEST(OutputFile, HoldsTheDecisionsByteForByte) {
    const TemporaryDirectory directory;
    for (const char* name : {"k40", "k6144"}) {
        const ToolRun run = runTool({"decode", shipped(std::string(name) + ".soft.npy"), "--units", "8",
                                     "--output", directory.path(name)});
        EXPECT_EQ(run.exitCode, 0) << run.err;
        EXPECT_EQ(readFile(directory.path(name)), readFile(shipped(std::string(name) + ".decided.npy")));
    }
    EXPECT_EQ(directory.names(), (std::vector<std::string>{"k40", "k6144"})) << "nothing else may be left";
}

TEST(OutputFile, ServesAsReference) {
    const TemporaryDirectory directory;
    decodeTo(directory.path("out.npy"));
    const ToolRun run =
        runTool({"decode", shipped("k40.soft.npy"), "--reference", directory.path("out.npy")});
    EXPECT_NE(run.out.find("bit errors    0 (BER 0.00e+00)\n"), std::string::npos) << run.out << run.err;
}

TEST(OutputFile, ReplacesAnOlderOne) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("out.npy", std::string(100000, 'x'));
    EXPECT_EQ(decodeTo(file).exitCode, 0);
    EXPECT_EQ(readFile(file), decided());
}

TEST(OutputFile, IsReachedThroughALinkThatStaysALink) {
    const TemporaryDirectory directory;
    directory.write("target.npy", "old");
    fs::create_symlink("target.npy", directory.path("link.npy"));
    EXPECT_EQ(decodeTo(directory.path("link.npy")).exitCode, 0);
    EXPECT_TRUE(fs::is_symlink(directory.path("link.npy")));
    EXPECT_EQ(readFile(directory.path("target.npy")), decided());
}

TEST(OutputFile, MayHaveAnyNameThatTheFileSystemTakes) {
    const TemporaryDirectory directory;
    const std::string name(255, 'x');
    EXPECT_EQ(decodeTo(directory.path(name)).exitCode, 0);
    EXPECT_EQ(directory.names(), std::vector<std::string>{name});
}

TEST(OutputFile, MayBeAPipe) {
    const TemporaryDirectory directory;
    const std::string pipe = directory.path("pipe");
    ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
    auto content = std::async(std::launch::async, [&pipe] { return readFile(pipe); });
    EXPECT_EQ(decodeTo(pipe).exitCode, 0);
    EXPECT_EQ(content.get(), decided());
}

TEST(OutputFile, IsReadableForOthersAsTheUserWants) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("out.npy");
    const mode_t before = ::umask(0027);
    decodeTo(file);
    ::umask(before);
    EXPECT_EQ(fs::status(file).permissions(), static_cast<fs::perms>(0640));
}

TEST(OutputFile, IsRefusedWhereThereIsNoDirectory) {
    const TemporaryDirectory directory;
    expectRefused(directory.path("none/out.npy"),
                  "cannot be written: No such file or directory; create its directory first");
}

TEST(OutputFile, IsRefusedWhenItIsADirectory) {
    const TemporaryDirectory directory;
    expectRefused(directory.path(""), "is a directory; give the name of a file");
}

TEST(OutputFile, IsRefusedWhenItsDirectoryIsAFile) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("file", "");
    expectRefused(file + "/out.npy", "cannot be written: Not a directory; choose another place");
}

TEST(OutputFile, IsRefusedWhenItsNameIsEmpty) {
    const ToolRun run = runTool({"decode", shipped("k40.soft.npy"), "-o", ""});
    EXPECT_EQ(run.err, "quarzel: error: -o: the name of the file is empty; give one\n");
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 2);
}

TEST(OutputFile, IsRefusedBeforeTheCaptureIsRead) {
    const TemporaryDirectory directory;
    const std::string output = directory.path("none/out.npy");
    const ToolRun run = runTool({"decode", directory.path("none.npy"), "-o", output});
    EXPECT_EQ(run.err, "quarzel: error: " + output +
                           ": cannot be written: No such file or directory; create its directory first\n");
    EXPECT_EQ(run.exitCode, 3);
}

TEST(OutputFile, IsRefusedWhenWriteProtected) {
    if (::geteuid() == 0) {
        GTEST_SKIP() << "nothing is write-protected for the superuser";
    }
    const TemporaryDirectory directory;
    const std::string file = directory.write("out.npy", "old");
    fs::permissions(file, fs::perms::owner_read);
    expectRefused(file, "cannot be written: Permission denied; choose a place that you may write to");
    EXPECT_EQ(readFile(file), "old");
}

TEST(OutputFile, TellsOfAFullDisk) {
    expectRefused("/dev/full", "cannot be written: No space left on device; free some space");
}

TEST(OutputFile, LeavesNothingWhenTheFileGrowsTooLarge) {
    const TemporaryDirectory directory;
    expectRefused(directory.path("out.npy"), "cannot be written: File too large; raise the limit (ulimit -f)",
                  {.fileSizeLimit = 1000});
    EXPECT_EQ(directory.names(), std::vector<std::string>{});
}

TEST(OutputFile, LeavesTheOlderOneWhenTheFileGrowsTooLarge) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("out.npy", "old");
    expectRefused(file, "cannot be written: File too large; raise the limit (ulimit -f)",
                  {.fileSizeLimit = 1000});
    EXPECT_EQ(readFile(file), "old");
    EXPECT_EQ(directory.names(), std::vector<std::string>{"out.npy"});
}

TEST(StandardOutput, IsReportedWhenItCannotBeWritten) {
    for (const std::vector<std::string>& arguments : {std::vector<std::string>{"info"},
                                                      {"--help"},
                                                      {"--version"},
                                                      {"decode", shipped("k40.soft.npy"), "--json"}}) {
        const ToolRun run = runTool(arguments, {.standardOutput = "/dev/full"});
        EXPECT_EQ(
            run.err,
            "quarzel: error: standard output: cannot be written; free some space or send it elsewhere\n");
        EXPECT_EQ(run.exitCode, 3);
    }
}

}  // namespace quarzel::test
