// SPDX-License-Identifier: MIT
// The two tables that an interleaver keeps: when they are computed anew, and where the inverse goes.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>

#include "interleaver/closed_form.hpp"
#include "interleaver/interleaver_3gpplte.hpp"
#include "interleaver/rotation.hpp"
#include "support/capture.hpp"

namespace quarzel::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

TEST(InterleaverBase, TakesEveryBlockSizeButZero) {
    const Rotation rotation;
    EXPECT_FALSE(rotation.valid(0));
    for (const unsigned K : {1U, 7U, 40U, 6145U, 0x80000000U, 0xFFFFFFFFU}) {
        EXPECT_TRUE(rotation.valid(K)) << K;
    }
}

TEST(InterleaverCache, ComputesThePermutationForTheInverse) {
    const Rotation rotation;
    EXPECT_TRUE(rotation.calcDeinterleaver(rotation.itsInversePermutation, 4));
    EXPECT_THAT(rotation.itsPermutation, ElementsAre(1, 2, 3, 0));
    EXPECT_THAT(rotation.itsInversePermutation, ElementsAre(3, 0, 1, 2));
    EXPECT_EQ(rotation.calls, 1U);
}

TEST(InterleaverCache, KeepsThePermutationWhileTheBlockSizeStays) {
    const Rotation rotation;
    rotation.calcDeinterleaver(rotation.itsInversePermutation, 5);
    const Permutation first = rotation.itsInversePermutation;
    EXPECT_TRUE(rotation.calcDeinterleaver(rotation.itsInversePermutation, 5));
    EXPECT_EQ(rotation.itsInversePermutation, first);
    EXPECT_EQ(rotation.calls, 1U);
}

TEST(InterleaverCache, ComputesThePermutationAnewForAnotherBlockSize) {
    const Rotation rotation;
    for (const unsigned K : {6U, 3U, 6U, 2U}) {
        EXPECT_TRUE(rotation.calcDeinterleaver(rotation.itsInversePermutation, K));
        EXPECT_EQ(rotation.itsPermutation.size(), K);
        EXPECT_EQ(rotation.itsInversePermutation.size(), K);
        EXPECT_EQ(rotation.itsInversePermutation[0], K - 1);
    }
    EXPECT_EQ(rotation.calls, 4U);
}

TEST(InterleaverCache, TakesAPermutationOfTheRightSizeAsItIs) {
    const Rotation rotation;
    rotation.itsPermutation = {2, 0, 1};
    EXPECT_TRUE(rotation.calcDeinterleaver(rotation.itsInversePermutation, 3));
    EXPECT_THAT(rotation.itsInversePermutation, ElementsAre(1, 2, 0));
    EXPECT_EQ(rotation.calls, 0U);
}

TEST(InterleaverCache, WritesTheInverseToItsOwnTableAndOnlySizesAForeignOne) {
    const Rotation rotation;
    Permutation foreign = {9, 8};
    EXPECT_TRUE(rotation.calcDeinterleaver(foreign, 4));
    EXPECT_THAT(foreign, ElementsAre(9, 8, 0, 0));
    EXPECT_THAT(rotation.itsInversePermutation, ElementsAre(3, 0, 1, 2));

    foreign = {9, 8, 7, 6};
    EXPECT_TRUE(rotation.calcDeinterleaver(foreign, 3));
    EXPECT_THAT(foreign, ElementsAre(9, 8, 7));
    EXPECT_THAT(rotation.itsInversePermutation, ElementsAre(2, 0, 1));
}

TEST(InterleaverCache, IsEmptyAfterARefusedBlockSize) {
    for (const unsigned K : {0U, 32U, 44U, 6152U, 65576U}) {
        const std::unique_ptr<TInterleaver> interleaver(TInterleaver3GPPLTE::create(""));
        interleaver->calcDeinterleaver(interleaver->itsInversePermutation, 40);
        ASSERT_EQ(interleaver->itsInversePermutation.size(), 40U);
        Permutation foreign = {1, 2, 3};
        const Output output = capture([&] {
            EXPECT_TRUE(interleaver->calcDeinterleaver(interleaver->itsInversePermutation, K));
            EXPECT_TRUE(interleaver->calcDeinterleaver(foreign, K));
        });
        EXPECT_EQ(output.out + output.err, "") << K;
        EXPECT_THAT(interleaver->itsPermutation, IsEmpty()) << K;
        EXPECT_THAT(interleaver->itsInversePermutation, IsEmpty()) << K;
        EXPECT_THAT(foreign, IsEmpty()) << K;
    }
}

TEST(InterleaverCache, ServesLteBlocksOfChangingSizes) {
    const std::unique_ptr<TInterleaver> interleaver(TInterleaver3GPPLTE::create(""));
    for (int repetition = 0; repetition < 2; ++repetition) {
        for (const auto& expected : {closedForm(6144, 263, 480), closedForm(40, 3, 10)}) {
            const auto K = static_cast<unsigned>(expected.size());
            ASSERT_TRUE(interleaver->calcDeinterleaver(interleaver->itsInversePermutation, K));
            EXPECT_EQ(interleaver->itsPermutation, expected);
            Permutation thereAndBack;
            for (const std::uint32_t position : interleaver->itsInversePermutation) {
                thereAndBack.push_back(interleaver->itsPermutation[position]);
            }
            EXPECT_TRUE(std::is_sorted(thereAndBack.begin(), thereAndBack.end()));
            EXPECT_EQ(thereAndBack.size(), K);
            EXPECT_EQ(thereAndBack.back(), K - 1);
        }
    }
}

}  // namespace
}  // namespace quarzel::test
