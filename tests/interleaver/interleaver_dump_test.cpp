// SPDX-License-Identifier: MIT
// The printed permutations, byte for byte.
#include <gtest/gtest.h>

#include <cstdint>
#include <iostream>
#include <memory>
#include <string>

#include "interleaver/closed_form.hpp"
#include "interleaver/interleaver_3gpplte.hpp"
#include "interleaver/lte_params.hpp"
#include "interleaver/rotation.hpp"
#include "support/capture.hpp"

namespace quarzel::test {
namespace {

const std::string line40 =
    "0 13 6 19 12 25 18 31 24 37 30 3 36 9 2 15 8 21 14 27 20 33 26 39 32 5 38 11 4 17 10 23 16 29 22 35 28 "
    "1 "
    "34 7\n";
const std::string line48 =
    "0 19 14 33 28 47 42 13 8 27 22 41 36 7 2 21 16 35 30 1 44 15 10 29 24 43 38 9 4 23 18 37 32 3 46 17 12 "
    "31 26 45 40 11 6 25 20 39 34 5\n";

/// What is dumped; nothing may go to the error stream.
std::string dump(const TInterleaver& interleaver, unsigned first, unsigned last, bool showK) {
    const Output output = capture([&] { interleaver.dumpAll(first, last, showK); });
    EXPECT_EQ(output.err, "");
    return output.out;
}

class InterleaverDump : public testing::Test {
  protected:
    std::unique_ptr<TInterleaver> interleaver{TInterleaver3GPPLTE::create("")};
};

TEST_F(InterleaverDump, PrintsAPermutationALine) {
    EXPECT_EQ(dump(*interleaver, 40, 40, false), line40);
    EXPECT_EQ(dump(*interleaver, 40, 48, false), line40 + line48);
}

TEST_F(InterleaverDump, BeginsALineWithTheBlockSizeOnRequest) {
    EXPECT_EQ(dump(*interleaver, 40, 40, true), "40: " + line40);
    EXPECT_EQ(dump(*interleaver, 33, 55, true), "40: " + line40 + "48: " + line48);
}

TEST_F(InterleaverDump, PrintsNothingForBlockSizesThatAreNotValid) {
    EXPECT_EQ(dump(*interleaver, 0, 39, true), "");
    EXPECT_EQ(dump(*interleaver, 41, 47, true), "");
    EXPECT_EQ(dump(*interleaver, 513, 527, false), "");
    EXPECT_EQ(dump(*interleaver, 6145, 7000, true), "");
}

TEST_F(InterleaverDump, PrintsNothingWhenTheFirstIsAboveTheLast) {
    EXPECT_EQ(dump(*interleaver, 48, 40, true), "");
    EXPECT_EQ(dump(*interleaver, 6144, 0, true), "");
}

TEST_F(InterleaverDump, EndsAtTheLargestNumber) {
    EXPECT_EQ(dump(*interleaver, 0xFFFFFFF0U, 0xFFFFFFFFU, true), "");
}

TEST_F(InterleaverDump, PrintsEveryBlockSizeOfLte) {
    std::string expected;
    for (const LteParams& params : lteParams) {
        std::string line = std::to_string(params.K) + ":";
        for (const std::uint32_t entry : closedForm(params.K, params.f1, params.f2)) {
            line += " " + std::to_string(entry);
        }
        expected += line + "\n";
    }
    EXPECT_EQ(dump(*interleaver, 0, 6144, true), expected);
    EXPECT_EQ(interleaver->itsPermutation.size(), 6144U);
}

TEST_F(InterleaverDump, ShowsTheTableThatTheInterleaverKeepsForTheBlockSize) {
    interleaver->itsPermutation.assign(40, 5);
    std::string expected = "40: 5";
    for (int i = 1; i < 40; ++i) {
        expected += " 5";
    }
    EXPECT_EQ(dump(*interleaver, 40, 40, true), expected + "\n");
}

TEST_F(InterleaverDump, IsDecimalWhateverTheProgramHasSetOnItsStream) {
    const std::ios_base::fmtflags flags = std::cout.flags();
    std::cout << std::hex << std::showbase;
    const std::string text = dump(*interleaver, 40, 40, true);
    std::cout.flags(flags);
    EXPECT_EQ(text, "40: " + line40);
}

TEST(InterleaverBaseDump, AsksTheFamilyWhichBlockSizesItHas) {
    EXPECT_EQ(dump(Rotation(), 0, 3, true), "1: 0\n2: 1 0\n3: 1 2 0\n");
    EXPECT_EQ(dump(Rotation(), 0, 3, false), "0\n1 0\n1 2 0\n");
}

}  // namespace
}  // namespace quarzel::test
