// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <sstream>

#include "captures/capture_file.hpp"
#include "npy_data.hpp"
#include "refusal.hpp"
#include "support/random.hpp"

namespace quarzel::test {

namespace {

constexpr int rounds = 300;

/// Two small blocks.
std::string smallNpy() {
    std::string data(2 * 3 * 44, '\0');
    for (std::size_t i = 0; i < data.size(); ++i) {
        data[i] = static_cast<char>(i);
    }
    return rawNpy(npyHeader("|i1", "(2, 3, 44)"), data);
}

/// Whether a capture is refused. Expects one line of error that begins with its name if it is, and blocks if
/// not.
bool isRefused(const std::string& content, const std::string& file) {
    std::istringstream stream(content);
    std::size_t blocks = 0;
    const std::string line = refusalOf([&] { blocks = tool::readCapture(stream, file).blocks(); });
    if (line.empty()) {
        EXPECT_GT(blocks, 0U);
        return false;
    }
    EXPECT_TRUE(line.starts_with("quarzel: error: " + file + ": ")) << line;
    EXPECT_EQ(std::count(line.begin(), line.end(), '\n'), 1) << line;
    return true;
}

}  // namespace

TEST(BrokenFile, IsRefusedWhereverANpyFileWasCut) {
    const std::string whole = smallNpy();
    EXPECT_FALSE(isRefused(whole, "whole.npy"));
    for (std::size_t length = 0; length < whole.size(); ++length) {
        EXPECT_TRUE(isRefused(whole.substr(0, length), "cut.npy")) << length;
    }
}

TEST(BrokenFile, IsRefusedOrReadWhicheverBytesOfANpyFileChanged) {
    std::mt19937 random = seededRandom();
    const std::string whole = smallNpy();
    const std::size_t headerEnd = whole.size() - 2 * 3 * 44;
    int refused = 0;
    for (int round = 0; round < rounds; ++round) {
        std::string broken = whole;
        for (auto changes = random() % 3 + 1; changes > 0; --changes) {
            broken[random() % headerEnd] = static_cast<char>(random());
        }
        refused += isRefused(broken, "broken.npy") ? 1 : 0;
    }
    EXPECT_GT(refused, rounds / 6);
}

TEST(BrokenFile, IsRefusedOrReadWhicheverBytesOfACsvFileChanged) {
    std::mt19937 random = seededRandom();
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
        refused += isRefused(broken, "broken.csv") ? 1 : 0;
    }
    EXPECT_GT(refused, rounds / 10);
}

}  // namespace quarzel::test
