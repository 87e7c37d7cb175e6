// SPDX-License-Identifier: MIT
#include "link/coding/segmentation.hpp"

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

/// The most bits that 13 code blocks hold.
constexpr int longest = 13 * (6144 - 24);

TEST(Segmentation, HasTheSizesOfTheStandardForEveryLength) {
    for (int B = 1; B <= longest; ++B) {
        const Segmentation found = segmentationOf(static_cast<std::size_t>(B));
        const standard::Sizes size = standard::sizes(B);
        const auto number = [](auto value) { return static_cast<int>(value); };
        ASSERT_EQ(number(found.B), B);
        ASSERT_EQ(number(found.C), size.C) << B;
        ASSERT_EQ(number(found.Kplus), size.Kplus) << B;
        ASSERT_EQ(number(found.Kminus), size.Kminus) << B;
        ASSERT_EQ(number(found.Cplus), size.Cplus) << B;
        ASSERT_EQ(number(found.Cminus), size.Cminus) << B;
        ASSERT_EQ(number(found.F), size.F) << B;
    }
}

/// Lengths to cut: some for each number of code blocks from 1 to 13, or all.
std::vector<int> lengths(std::mt19937& random) {
    std::vector<int> list = {1, 39, 40, 41, 6144, 6145, longest};
    for (int C = 1; C <= 13; ++C) {
        for (int i = 0; i < 8; ++i) {
            list.push_back((C - 1) * (6144 - 24) + 25 + quarzel::test::randomBelow(random, 6144 - 48));
        }
    }
    if (quarzel::test::isExhaustive()) {
        list.resize(longest);
        std::iota(list.begin(), list.end(), 1);
    }
    return list;
}

TEST(Segmentation, CutsAsTheStandardDoesAndIsUndone) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const int B : lengths(random)) {
        const Bytes bits = quarzel::test::randomBits(random, static_cast<std::size_t>(B));
        const Segmentation segmentation = segmentationOf(bits.size());
        Bytes blocks(segmentation.totalSize());
        segment(segmentation, bits, blocks);

        standard::Bits expected;
        for (const standard::Bits& block : standard::segments(toStandard(bits))) {
            expected.insert(expected.end(), block.begin(), block.end());
        }
        ASSERT_EQ(toStandard(blocks), expected) << B;

        Bytes back(bits.size());
        ASSERT_THAT(desegment(segmentation, blocks, back),
                    testing::AllOf(testing::SizeIs(segmentation.C), testing::Each(true)));
        ASSERT_EQ(back, bits) << B;
    }
}

TEST(Segmentation, TellsTheBlocksWhoseCrcFails) {
    std::mt19937 random = quarzel::test::seededRandom();
    const Segmentation segmentation = segmentationOf(13000);
    ASSERT_EQ(segmentation.C, 3);
    const Bytes bits = quarzel::test::randomBits(random, segmentation.B);
    Bytes blocks(segmentation.totalSize());
    segment(segmentation, bits, blocks);
    Bytes back(bits.size());
    std::size_t end = 0;
    for (std::size_t r = 0; r < segmentation.C; ++r) {
        end += segmentation.size(r);
        std::vector<bool> expected(segmentation.C, true);
        expected[r] = false;
        blocks[end - 1] ^= 1;
        EXPECT_EQ(desegment(segmentation, blocks, back), expected);
        blocks[end - 1] ^= 1;
    }
}

TEST(Segmentation, TakesNoNoticeOfWhatStandsAtFillerBits) {
    std::mt19937 random = quarzel::test::seededRandom();
    const Segmentation segmentation = segmentationOf(6145);
    ASSERT_GT(segmentation.F, 0);
    const Bytes bits = quarzel::test::randomBits(random, segmentation.B);
    Bytes blocks(segmentation.totalSize());
    segment(segmentation, bits, blocks);
    std::fill_n(blocks.begin(), segmentation.F, std::uint8_t{1});
    Bytes back(bits.size());
    EXPECT_THAT(desegment(segmentation, blocks, back), testing::Each(true));
    EXPECT_EQ(back, bits);
}

// Reference measurement channels A13-2 and A13-3 of TS 36.104, Annex A: payload, code blocks, coded size of
// each.
TEST(Segmentation, HasTheCodeBlocksOfReferenceMeasurementChannels) {
    struct Channel {
        std::size_t payload, blocks, coded;
    };
    for (const Channel& channel : {Channel{4264, 1, 12876}, Channel{7224, 2, 10956}}) {
        const Segmentation segmentation = segmentationOf(channel.payload + 24);
        EXPECT_EQ(segmentation.C, channel.blocks);
        EXPECT_EQ(segmentation.F, 0);
        for (std::size_t r = 0; r < segmentation.C; ++r) {
            EXPECT_EQ(3 * (segmentation.size(r) + 4), channel.coded);
        }
    }
}

TEST(Segmentation, NamesTheSizesThatFit) {
    using testing::ThrowsMessage;
    EXPECT_THAT(
        [] { segmentationOf(0); },
        ThrowsMessage<std::invalid_argument>("there must be at least 1 bit to cut into code blocks, not 0"));
    const Segmentation segmentation = segmentationOf(41);
    Bytes bits(41);
    Bytes blocks(48);
    Bytes wrong(40);
    EXPECT_THAT(
        [&] { segment(segmentation, wrong, blocks); },
        ThrowsMessage<std::invalid_argument>("there must be 41 bits to cut into code blocks, not 40"));
    EXPECT_THAT([&] { segment(segmentation, bits, wrong); },
                ThrowsMessage<std::invalid_argument>("there must be 48 bits of code blocks, not 40"));
    EXPECT_THAT([&] { desegment(segmentation, wrong, bits); },
                ThrowsMessage<std::invalid_argument>("there must be 48 bits of code blocks, not 40"));
    EXPECT_THAT([&] { desegment(segmentation, blocks, wrong); },
                ThrowsMessage<std::invalid_argument>(
                    "there must be 41 bits of a transport block with its CRC, not 40"));
}

}  // namespace
