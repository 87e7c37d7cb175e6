// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// Run the tool on the stand-in model with three blocks, the second of which asks for something to happen.
ToolRun runWithSecondBlock(std::int8_t request, const TemporaryDirectory& directory) {
    xt::xarray<std::int8_t> soft = xt::zeros<std::int8_t>({3, 3, 44});
    soft(1, 0, 0) = request;
    xt::dump_npy(directory.path("capture.npy"), soft);
    return runTool({"decode", directory.path("capture.npy"), "-o", directory.path("out.npy"), "--json"},
                   {.program = QUARZEL_TOOL_ON_STAND_IN});
}

void expectFailure(const ToolRun& run, const std::string& message, const TemporaryDirectory& directory) {
    EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_EQ(directory.names(), std::vector<std::string>{"capture.npy"}) << "no output may be left";
}

/// What the user is told of a block that the stand-in model refused.
std::string refused(const TemporaryDirectory& directory, const std::string& block, int status) {
    return directory.path("capture.npy") + ": block " + block + " could not be decoded (status " +
           std::to_string(status) + "); the model says: Number of iterations must be in the range 1 to 15";
}

}  // namespace

TEST(Failure, DoesNotComeFromTheStandInUnasked) {
    const TemporaryDirectory directory;
    EXPECT_EQ(runWithSecondBlock(0, directory).exitCode, 0);
}

TEST(Failure, NamesTheBlockThatTheDecoderRefused) {
    const TemporaryDirectory directory;
    expectFailure(runWithSecondBlock(2, directory), refused(directory, "1 of 0 to 2", 2), directory);
}

TEST(Failure, NamesTheBlockAtWhichTheDecoderBroke) {
    const TemporaryDirectory directory;
    expectFailure(runWithSecondBlock(99, directory), refused(directory, "1 of 0 to 2", 99), directory);
}

// The second block fails at once, while another thread is still busy with the first, which fails after it.
TEST(Failure, NamesTheFirstBlockThatFailedWhicheverThreadWasQuicker) {
    const TemporaryDirectory directory;
    xt::xarray<std::int8_t> soft = xt::zeros<std::int8_t>({64, 3, 44});
    soft(0, 0, 0) = 1;
    soft(1, 0, 0) = 3;
    soft(9, 0, 0) = 2;
    xt::dump_npy(directory.path("capture.npy"), soft);
    for (const char* threads : {"1", "2", "8"}) {
        expectFailure(runTool({"decode", directory.path("capture.npy"), "--threads", threads},
                              {.program = QUARZEL_TOOL_ON_STAND_IN}),
                      refused(directory, "1 of 0 to 63", 3), directory);
    }
}

TEST(Failure, TellsWhenMemoryRunsOut) {
    const TemporaryDirectory directory;
    expectFailure(runWithSecondBlock(-1, directory),
                  "there is not enough memory; cut the capture into smaller files", directory);
}

}  // namespace quarzel::test
