// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <random>

#include "long_runs.hpp"
#include "npy_data.hpp"
#include "run_tool.hpp"
#include "support/random.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

constexpr int rounds = 300 / everyNthRun;

/// Two small blocks.
std::string smallNpy() {
    std::string data(2 * 3 * 44, '\0');
    for (std::size_t i = 0; i < data.size(); ++i) {
        data[i] = static_cast<char>(i);
    }
    return rawNpy(npyHeader("|i1", "(2, 3, 44)"), data);
}

/// Expect one line of error that begins with the name of the file, or a decoded capture.
void expectToldOrDecoded(const ToolRun& run, const std::string& file) {
    if (run.exitCode == 0) {
        EXPECT_EQ(run.err, "");
        return;
    }
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_EQ(run.out, "");
    EXPECT_TRUE(run.err.starts_with("quarzel: error: " + file + ": ")) << run.err;
    EXPECT_EQ(std::count(run.err.begin(), run.err.end(), '\n'), 1) << run.err;
}

}  // namespace

TEST(BrokenFile, IsRefusedWhereverANpyFileWasCut) {
    const TemporaryDirectory directory;
    const std::string whole = smallNpy();
    ASSERT_EQ(runTool({"decode", directory.write("whole.npy", whole)}).exitCode, 0);
    for (std::size_t length = 0; length < whole.size(); length += everyNthRun) {
        SCOPED_TRACE(length);
        const std::string file = directory.write("cut.npy", whole.substr(0, length));
        const ToolRun run = runTool({"decode", file});
        ASSERT_EQ(run.exitCode, 3);
        expectToldOrDecoded(run, file);
    }
}

TEST(BrokenFile, IsToldOrDecodedWhicheverBytesOfANpyFileChanged) {
    std::mt19937 random = seededRandom();
    const TemporaryDirectory directory;
    const std::string whole = smallNpy();
    const std::size_t headerEnd = whole.size() - 2 * 3 * 44;
    int refused = 0;
    for (int round = 0; round < rounds; ++round) {
        std::string broken = whole;
        for (auto changes = random() % 3 + 1; changes > 0; --changes) {
            broken[random() % headerEnd] = static_cast<char>(random());
        }
        const std::string file = directory.write("broken.npy", broken);
        const ToolRun run = runTool({"decode", file});
        expectToldOrDecoded(run, file);
        refused += run.exitCode == 3 ? 1 : 0;
    }
    EXPECT_GT(refused, rounds / 6);
}

TEST(BrokenFile, IsToldOrDecodedWhicheverBytesOfACsvFileChanged) {
    std::mt19937 random = seededRandom();
    const TemporaryDirectory directory;
    std::string whole = "systematic,parity1,parity2\n";
    for (int position = 0; position < 44; ++position) {
        whole += "1,-20,3\n";
    }
    int refused = 0;
    for (int round = 0; round < rounds; ++round) {
        std::string broken = whole.substr(0, random() % 4 == 0 ? random() % whole.size() : whole.size());
        for (auto changes = random() % 3; changes > 0 && !broken.empty(); --changes) {
            broken[random() % broken.size()] = "\n,-+ 19x\r\xff"[random() % 10];
        }
        const std::string file = directory.write("broken.csv", broken);
        const ToolRun run = runTool({"decode", file});
        if (run.err.starts_with("WARNING:")) {
            continue;  // a change has made a value longer than 8 bits
        }
        expectToldOrDecoded(run, file);
        refused += run.exitCode == 3 ? 1 : 0;
    }
    EXPECT_GT(refused, rounds / 10);
}

}  // namespace quarzel::test
