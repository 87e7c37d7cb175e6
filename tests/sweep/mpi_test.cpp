// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>

#include "sweep/result.hpp"
#include "sweeps.hpp"
#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// Run quarzel-mpi with more ranks than there may be cores, as root where tests are root.
ToolRun runMpi(const char* ranks, const std::vector<std::string>& arguments) {
    for (const char* const name :
         {"OMPI_ALLOW_RUN_AS_ROOT", "OMPI_ALLOW_RUN_AS_ROOT_CONFIRM", "OMPI_MCA_rmaps_base_oversubscribe"}) {
        ::setenv(name, "1", 1);
    }
    ::setenv("ASAN_OPTIONS", "detect_leaks=0", 1);  // MPI libraries leak
    std::vector<std::string> all = {"-n", ranks, QUARZEL_MPI};
    all.insert(all.end(), arguments.begin(), arguments.end());
    return runTool(all, {.program = QUARZEL_MPIEXEC});
}

const std::vector<std::string> quickSweep = {
    "sweep",   "--block-size", "40,104", "--algorithm",  "0,2", "--iterations",       "3",  "--ebn0",
    "0,1.5,3", "--seed",       "7",      "--max-blocks", "301", "--max-block-errors", "50", "--json"};

}  // namespace

TEST(Mpi, GivesTheSameResultWithAnyNumberOfRanks) {
    const std::string expected = sweep::resultText(resultOf(smallSweep()));
    for (const char* const ranks : {"1", "4"}) {
        const ToolRun run = runMpi(ranks, quickSweep);
        EXPECT_EQ(run.out, expected) << run.err;
        EXPECT_EQ(run.exitCode, 0);
    }
}

TEST(Mpi, GivesTheSameResultForCodedLinks) {
    const std::vector<std::string> arguments = {"sweep",
                                                "--transport-block",
                                                "90,6200",
                                                "--code-rate",
                                                "1/2",
                                                "--modulation",
                                                "qpsk",
                                                "--channel",
                                                "rayleigh-block",
                                                "--rv",
                                                "0,3",
                                                "--stop",
                                                "crc",
                                                "--iterations",
                                                "3",
                                                "--ebn0",
                                                "1,5",
                                                "--seed",
                                                "7",
                                                "--max-blocks",
                                                "61",
                                                "--max-block-errors",
                                                "11",
                                                "--json"};
    EXPECT_EQ(runMpi("3", arguments).out, sweep::resultText(resultOf(transportSweep())));
}

TEST(Mpi, GivesTheSameResultWithThreadsInRanks) {
    std::vector<std::string> arguments = quickSweep;
    arguments.insert(arguments.end(), {"--threads", "2"});
    EXPECT_EQ(runMpi("3", arguments).out, sweep::resultText(resultOf(smallSweep())));
}

TEST(Mpi, KeepsTheSameFailures) {
    const TemporaryDirectory directory;
    std::vector<std::string> arguments = quickSweep;
    arguments.insert(arguments.end(), {"--keep-failures", "2", "-o"});
    const auto listOf = [&](const std::string& name, bool isMpi) {
        std::vector<std::string> all = arguments;
        all.push_back(directory.path(name));
        EXPECT_EQ((isMpi ? runMpi("3", all) : runTool(all)).exitCode, 0);
        return readFile(directory.path(name + ".failures/failures.csv"));
    };
    const std::string list = listOf("threads.json", false);
    EXPECT_GT(std::count(list.begin(), list.end(), '\n'), 10);
    EXPECT_EQ(listOf("ranks.json", true), list);
    EXPECT_EQ(listOf("ranks.json", true), list) << "looked for again";
}

TEST(Mpi, TellsAnErrorOnce) {
    const ToolRun run = runMpi("3", {"sweep"});
    const std::string error = "quarzel: error: --ebn0 is required; see 'quarzel sweep --help'\n";
    const std::size_t place = run.err.find(error);
    ASSERT_NE(place, std::string::npos) << run.err;
    EXPECT_EQ(run.err.find(error, place + 1), std::string::npos);
    EXPECT_EQ(run.exitCode, 2);
}

}  // namespace quarzel::test
