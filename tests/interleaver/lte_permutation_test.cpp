// SPDX-License-Identifier: MIT
// The interleaver of LTE for all block sizes, and the sizes it refuses.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <memory>
#include <vector>

#include "interleaver/closed_form.hpp"
#include "interleaver/interleaver_3gpplte.hpp"
#include "interleaver/lte_block_sizes.hpp"
#include "interleaver/lte_params.hpp"
#include "support/capture.hpp"

namespace quarzel::test {
namespace {

using testing::IsEmpty;

class LtePermutation : public testing::Test {
  protected:
    std::unique_ptr<TInterleaver> interleaver{TInterleaver3GPPLTE::create("")};
};

TEST_F(LtePermutation, OfTheSmallestBlockIsTheWorkedOne) {
    Permutation permutation;
    ASSERT_TRUE(interleaver->calcInterleaver(permutation, 40));
    EXPECT_THAT(permutation, testing::ElementsAre(0, 13, 6, 19, 12, 25, 18, 31, 24, 37, 30, 3, 36, 9, 2, 15,
                                                  8, 21, 14, 27, 20, 33, 26, 39, 32, 5, 38, 11, 4, 17, 10, 23,
                                                  16, 29, 22, 35, 28, 1, 34, 7));
}

TEST_F(LtePermutation, FollowsThePolynomialForEveryBlockSize) {
    for (const LteParams& row : lteParams) {
        Permutation permutation;
        ASSERT_TRUE(interleaver->calcInterleaver(permutation, row.K)) << row.K;
        EXPECT_EQ(permutation, closedForm(row.K, row.f1, row.f2)) << row.K;
    }
}

TEST_F(LtePermutation, ReadsEveryPositionOnceForEveryBlockSize) {
    for (const std::uint32_t K : lteBlockSizes()) {
        Permutation permutation;
        ASSERT_TRUE(interleaver->calcInterleaver(permutation, K)) << K;
        ASSERT_EQ(permutation.size(), K);
        std::sort(permutation.begin(), permutation.end());
        for (std::uint32_t i = 0; i < K; ++i) {
            ASSERT_EQ(permutation[i], i) << K;
        }
    }
}

TEST_F(LtePermutation, HasItsInverseForEveryBlockSize) {
    for (const LteParams& row : lteParams) {
        ASSERT_TRUE(interleaver->calcDeinterleaver(interleaver->itsInversePermutation, row.K)) << row.K;
        const Permutation expected = closedForm(row.K, row.f1, row.f2);
        ASSERT_EQ(interleaver->itsPermutation, expected) << row.K;
        ASSERT_EQ(interleaver->itsInversePermutation.size(), row.K);
        for (std::uint32_t i = 0; i < row.K; ++i) {
            ASSERT_EQ(interleaver->itsInversePermutation[expected[i]], i) << row.K;
        }
    }
}

TEST_F(LtePermutation, ReplacesWhatTheTableHeldAndTouchesNoOther) {
    Permutation permutation(7000, 9);
    ASSERT_TRUE(interleaver->calcInterleaver(permutation, 48));
    EXPECT_EQ(permutation, closedForm(48, 7, 12));
    EXPECT_THAT(interleaver->itsPermutation, IsEmpty());
    EXPECT_THAT(interleaver->itsInversePermutation, IsEmpty());
}

TEST_F(LtePermutation, IsKnownForTheBlockSizesOfLteAlone) {
    const std::vector<std::uint32_t> sizes = lteBlockSizes();
    const Output output = capture([&] {
        for (std::uint32_t K = 0; K <= 8192; ++K) {
            const bool expected = std::binary_search(sizes.begin(), sizes.end(), K);
            EXPECT_EQ(interleaver->valid(K), expected) << K;
            Permutation permutation = {1, 2, 3};
            EXPECT_EQ(interleaver->calcInterleaver(permutation, K), expected) << K;
            EXPECT_EQ(permutation.size(), expected ? K : 0) << K;
        }
    });
    EXPECT_EQ(output.out + output.err, "");
}

TEST_F(LtePermutation, IsRefusedForSizesOfAnyMagnitude) {
    for (const std::uint32_t K : {0U, 8U, 32U, 39U, 44U, 520U, 6145U, 6152U, 65576U, 0x80000000U, 0x80000028U,
                                  0xFFFFFFF8U, 0xFFFFFFFFU}) {
        EXPECT_FALSE(interleaver->valid(K)) << K;
    }
}

TEST_F(LtePermutation, ReservesRoomForASizeBeforeItIsRefused) {
    for (const std::uint32_t K : {8U, 32U, 39U, 44U, 520U, 6145U, 6152U, 65576U}) {
        Permutation permutation = {1, 2, 3};
        EXPECT_FALSE(interleaver->calcInterleaver(permutation, K)) << K;
        EXPECT_THAT(permutation, IsEmpty()) << K;
        EXPECT_GE(permutation.capacity(), K) << K;
    }
}

}  // namespace
}  // namespace quarzel::test
