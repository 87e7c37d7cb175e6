// SPDX-License-Identifier: MIT
#include "link/coding/sub_block_interleaver.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <numeric>

#include "link/coding/coding_setup.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::Bytes;
using quarzel::test::toStandard;
namespace standard = quarzel::test::standard;

TEST(SubBlockInterleaver, IsThatOfTheStandardForAllBlockSizesAndIsUndone) {
    for (const int K : standard::blockSizes()) {
        for (const unsigned stream : {0U, 1U, 2U}) {
            standard::Bits positions(static_cast<std::size_t>(K + 4));
            std::iota(positions.begin(), positions.end(), 0);
            const standard::Bits expected = standard::subBlock(positions, static_cast<int>(stream));
            const std::vector<std::uint16_t> found = subBlockInterleaving(positions.size(), stream);
            ASSERT_EQ(found.size(), expected.size());
            for (std::size_t k = 0; k < found.size(); ++k) {
                ASSERT_EQ(found[k] == dummyPosition ? standard::null : found[k], expected[k]) << K;
            }

            // Positions as soft values, and any value at dummies, come back in order.
            const std::vector<std::int16_t> soft(expected.begin(), expected.end());
            std::vector<std::int16_t> back(positions.size());
            subBlockDeinterleave(soft, stream, back);
            ASSERT_EQ(std::vector<int>(back.begin(), back.end()), positions) << K;
        }
    }
}

TEST(SubBlockInterleaver, MovesBitsAndMarksDummies) {
    std::mt19937 random = quarzel::test::seededRandom();
    const Bytes bits = quarzel::test::randomBits(random, 44);
    for (const unsigned stream : {0U, 1U, 2U}) {
        Bytes interleaved(64);
        subBlockInterleave(bits, stream, interleaved);
        EXPECT_EQ(toStandard(interleaved), standard::subBlock(toStandard(bits), static_cast<int>(stream)));
    }
}

TEST(SubBlockInterleaver, NamesTheSizesThatFit) {
    using testing::ThrowsMessage;
    Bytes bits(44);
    EXPECT_THAT([&] { subBlockInterleave(bits, 0, bits); },
                ThrowsMessage<std::invalid_argument>("there must be 64 interleaved values, not 44"));
    EXPECT_THAT([] { subBlockInterleaving(0, 0); },
                ThrowsMessage<std::invalid_argument>("a stream has 1 to 6148 values, not 0"));
    EXPECT_THAT([] { subBlockInterleaving(6149, 0); },
                ThrowsMessage<std::invalid_argument>("a stream has 1 to 6148 values, not 6149"));
    EXPECT_THAT([] { subBlockInterleaving(44, 3); },
                ThrowsMessage<std::invalid_argument>("the streams are 0, 1 and 2; there is no 3"));
}

}  // namespace
