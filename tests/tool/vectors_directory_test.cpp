// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>

#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace fs = std::filesystem;

namespace quarzel::test {

namespace {

/// Where `quarzel vectors` may write, and what `quarzel compare` makes of a set afterwards.
class VectorsDirectory : public testing::Test {
  protected:
    ToolRun make(std::vector<std::string> options = {}, const ToolSetting& setting = {}) {
        options.insert(options.begin(), {"vectors", itsSet, "--blocks", "2"});
        return runTool(options, setting);
    }

    void expectRefused(const ToolRun& run, const std::string& message, int exitCode = 3) {
        EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, exitCode);
    }

    TemporaryDirectory itsDirectory;
    std::string itsSet = itsDirectory.path("set");
    std::string itsCore = itsSet + "/u2_a1";
};

}  // namespace

TEST_F(VectorsDirectory, MayBeThereWhenItIsEmpty) {
    fs::create_directory(itsSet);
    EXPECT_EQ(make().exitCode, 0);
    EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{"set"});
}

TEST_F(VectorsDirectory, IsRefusedWhenItIsNotEmpty) {
    ASSERT_EQ(make().exitCode, 0);
    const std::string before = readFile(itsCore + "/dout.hex");
    expectRefused(make({"--seed", "2"}),
                  itsSet + ": is not empty; give another name, or --replace for an older vector set");
    EXPECT_EQ(readFile(itsCore + "/dout.hex"), before);
}

TEST_F(VectorsDirectory, IsReplacedOnDemandWhenItIsAnOlderSet) {
    ASSERT_EQ(make({"--units", "2,4"}).exitCode, 0);
    const std::string before = readFile(itsCore + "/dout.hex");
    ASSERT_EQ(make({"--seed", "2", "--replace"}).exitCode, 0);
    EXPECT_NE(readFile(itsCore + "/dout.hex"), before);
    EXPECT_FALSE(fs::exists(itsSet + "/u4_a1")) << "the older set is gone";
    EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{"set"});
}

TEST_F(VectorsDirectory, IsNotReplacedWhenItHoldsAnythingElse) {
    fs::create_directory(itsSet);
    const std::string precious = itsDirectory.write("set/precious", "");
    expectRefused(make({"--replace"}), itsSet + ": is not empty and no vector set; give another name");
    fs::remove(precious);
    ASSERT_EQ(make().exitCode, 0);
    itsDirectory.write("set/u2_a1/simulated.hex", "");
    expectRefused(
        make({"--replace"}),
        itsCore + "/simulated.hex: is not part of the vector set that would be replaced; move it away");
    EXPECT_TRUE(fs::exists(itsCore + "/simulated.hex"));
}

TEST_F(VectorsDirectory, IsRefusedWhereItCannotBe) {
    itsDirectory.write("file", "");
    itsSet = itsDirectory.path("file");
    expectRefused(make(), itsSet + ": is a file; give the name of a directory that is to be made");
    itsSet = itsDirectory.path("none/set");
    expectRefused(make(),
                  itsSet + ": cannot be written: No such file or directory; create its directory first");
    EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{"file"});
}

TEST_F(VectorsDirectory, IsNotThereWhenAFileCannotBeWritten) {
    expectRefused(make({"--block-size", "6144"}, {.fileSizeLimit = 10000}),
                  itsCore + "/rsc1_sys.hex: cannot be written: File too large; raise the limit (ulimit -f)");
    EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{});
}

TEST_F(VectorsDirectory, IsNotThereWhenTheToolIsInterrupted) {
    const std::string interrupted = R"sh(env --default-signal=INT \
                                             "$0" vectors "$1" --block-size 6144 --blocks 100000 &
                                         until [ -n "$(ls -A "$2")" ]; do sleep 0.01; done
                                         kill -s INT $!
                                         wait $!)sh";
    const ToolRun run =
        runTool({"-c", interrupted, QUARZEL_TOOL, itsSet, itsDirectory.path("")}, {.program = "/bin/sh"});
    expectRefused(run, itsSet + ": was not made, since a signal came; run the command again", 4);
    EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{});
}

TEST_F(VectorsDirectory, KeepsWhatAppearsInTheOlderSetWhileItIsReplaced) {
    ASSERT_EQ(make().exitCode, 0);
    const std::string script = R"sh("$0" vectors "$1" --block-size 6144 --blocks 300 --replace &
                                    until [ -n "$(ls -d "$2"/.quarzel-* 2>&-)" ]; do sleep 0.01; done
                                    echo precious > "$1/u2_a1/simulated.hex"
                                    wait $!)sh";
    const ToolRun run =
        runTool({"-c", script, QUARZEL_TOOL, itsSet, itsDirectory.path("")}, {.program = "/bin/sh"});
    EXPECT_EQ(run.exitCode, 0);
    const std::vector<std::string> names = itsDirectory.names();
    ASSERT_EQ(names.size(), 2U) << "the older set is kept under another name";
    EXPECT_EQ(run.err, "quarzel: warning: " + itsSet +
                           ": files that are not part of the older set are kept in " +
                           itsDirectory.path(names[0]) + '\n');
    EXPECT_EQ(readFile(itsDirectory.path(names[0]) + "/u2_a1/simulated.hex"), "precious\n");
    EXPECT_FALSE(fs::exists(itsDirectory.path(names[0]) + "/manifest.json"));
    EXPECT_FALSE(fs::exists(itsCore + "/simulated.hex"));
}

TEST_F(VectorsDirectory, OfAnotherRunIsNotReplacedUnasked) {
    const std::string script = R"sh("$0" vectors "$1" --block-size 6144 --blocks 300 &
                                    until [ -n "$(ls -A "$2")" ]; do sleep 0.01; done
                                    "$0" vectors "$1" --seed 2 > "$2/report"
                                    wait $!)sh";
    const ToolRun run =
        runTool({"-c", script, QUARZEL_TOOL, itsSet, itsDirectory.path("")}, {.program = "/bin/sh"});
    expectRefused(run, itsSet + ": cannot be written: Directory not empty; choose another place");
    EXPECT_EQ(runTool({"compare", itsCore, itsCore + "/dout.hex"}).exitCode, 0);
    EXPECT_EQ(itsDirectory.names(), (std::vector<std::string>{"report", "set"}));
}

TEST_F(VectorsDirectory, KeepsItsMode) {
    fs::create_directory(itsSet);
    fs::permissions(itsSet, static_cast<fs::perms>(0750));
    ASSERT_EQ(make().exitCode, 0);
    EXPECT_EQ(fs::status(itsSet).permissions(), static_cast<fs::perms>(0750));
    ASSERT_EQ(make({"--replace"}).exitCode, 0);
    EXPECT_EQ(fs::status(itsSet).permissions(), static_cast<fs::perms>(0750));
}

TEST_F(VectorsDirectory, IsNotReplacedWhenItCannotBeReadThrough) {
    if (::geteuid() != 0) {
        GTEST_SKIP() << "only the superuser can become another user";
    }
    ASSERT_EQ(make().exitCode, 0);
    ASSERT_EQ(::chmod(itsDirectory.path("").c_str(), 0777), 0);
    ASSERT_EQ(::chmod(itsCore.c_str(), 0700), 0);
    const ToolRun run = runTool(
        {"--reuid=65534", "--regid=65534", "--clear-groups", QUARZEL_TOOL, "vectors", itsSet, "--replace"},
        {.program = "/usr/bin/setpriv"});
    expectRefused(run, itsSet + ": cannot be read: Permission denied; make it readable");
}

TEST_F(VectorsDirectory, IsWhatCompareExpects) {
    ASSERT_EQ(make({"--block-size", "40,48"}).exitCode, 0);
    std::string simulated = readFile(itsCore + "/dout.hex");
    itsDirectory.write("sim.hex", simulated);
    for (const std::string& expected :
         {itsSet, itsSet + '/', itsCore, itsCore + '/', itsCore + "/dout.hex"}) {
        const ToolRun run = runTool({"compare", expected, itsDirectory.path("sim.hex")});
        EXPECT_EQ(run.exitCode, 0) << expected << ": " << run.err << run.out;
        EXPECT_NE(run.out.find("compared      4 blocks, 176 bits\n"), std::string::npos) << run.out;
    }
    simulated.resize(simulated.size() - 2);
    itsDirectory.write("sim.hex", simulated + "x\n");
    const ToolRun run = runTool({"compare", itsCore, itsDirectory.path("sim.hex")});
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_NE(run.out.find("block         3 of 0 to 3 (K = 48, 6 iterations, noise)\n"
                           "bit           47 of 0 to 47\n"),
              std::string::npos)
        << run.out;
    EXPECT_NE(run.out.find("\n  quarzel decode " + itsCore +
                           "/npy/k48_i6.soft.npy --units 2 --algorithm 1 --iterations 6 --trace 12 "
                           "--trace-block 1\n"),
              std::string::npos)
        << run.out;
}

TEST_F(VectorsDirectory, MustBeAsItWasMadeForCompare) {
    ASSERT_EQ(make().exitCode, 0);
    std::string text = readFile(itsCore + "/dout.hex");
    text[text.size() - 2] ^= 1;
    itsDirectory.write("set/u2_a1/dout.hex", text);
    expectRefused(runTool({"compare", itsCore, itsCore + "/dout.hex"}),
                  itsCore +
                      "/dout.hex: is not the file that was made with this set: its SHA-256 differs; make the "
                      "set again with 'quarzel vectors'");
    itsDirectory.write("set/manifest.json", "{}");
    expectRefused(runTool({"compare", itsCore, itsCore + "/dout.hex"}),
                  itsSet +
                      "/manifest.json: is not a well-formed manifest; make the set again with 'quarzel "
                      "vectors'");
    itsDirectory.write("set/manifest.json", R"({"format": "quarzel test vectors", "version": 9})");
    expectRefused(
        runTool({"compare", itsCore, itsCore + "/dout.hex"}),
        itsSet + "/manifest.json: has version 9, not 1 or 2; make the set again with 'quarzel vectors'");
}

TEST_F(VectorsDirectory, OfSeveralCoresDoesNotSayWhichIsCompared) {
    ASSERT_EQ(make({"--units", "2,8"}).exitCode, 0);
    expectRefused(runTool({"compare", itsSet, itsCore + "/dout.hex"}),
                  itsSet + ": holds the vectors of several cores; name one: " + itsSet + "/u2_a1, " + itsSet +
                      "/u8_a1");
}

}  // namespace quarzel::test
