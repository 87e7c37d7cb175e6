// SPDX-License-Identifier: MIT
#include "link/random_source.hpp"

#include <Random123/philox.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <set>
#include <vector>

#include "support/random.hpp"

namespace {

using namespace quarzel::link;

constexpr BlockName name = {0x0123456789abcdef, 1024, {600000}, 5};

std::vector<std::uint32_t> wordsOf(const BlockName& block, Purpose purpose = Purpose::noise) {
    std::vector<std::uint32_t> words(wordsPerGroup);
    RandomSource(block).words(purpose, 0, 1, words.data());
    return words;
}

// The known-answer tests that the authors of the generator publish.
TEST(DrawFunctions, GiveThePublishedAnswersOfPhilox) {
    for (std::size_t i = 0; i < supportedDrawFunctions().size; ++i) {
        std::array<std::uint32_t, wordsPerGroup> words{};
        const auto first = [&words] {
            return std::vector<std::uint32_t>{words[0], words[16], words[32], words[48]};
        };
        const DrawFunctions& draw = *supportedDrawFunctions().first[i];
        draw.drawWords({{0, 0, 0, 0}, {0, 0}}, 1, words.data());
        EXPECT_THAT(first(), testing::ElementsAre(0x6627e8d5, 0xe169c58d, 0xbc57ac4c, 0x9b00dbd8));
        draw.drawWords({{0x243f6a88, 0x85a308d3, 0x13198a2e, 0x03707344}, {0xa4093822, 0x299f31d0}}, 1,
                       words.data());
        EXPECT_THAT(first(), testing::ElementsAre(0xd16cfe09, 0x94fdcceb, 0x5001e420, 0x24126ea1));
    }
}

TEST(DrawFunctions, GiveTheNumbersOfTheLibraryForEveryCounter) {
    std::mt19937 random = quarzel::test::seededRandom();
    PhiloxInput input{};
    for (std::uint32_t* word : {&input.counter[0], &input.counter[1], &input.counter[2], &input.counter[3],
                                &input.key[0], &input.key[1]}) {
        *word = static_cast<std::uint32_t>(random());
    }
    constexpr std::uint32_t groups = 5;
    for (std::size_t i = 0; i < supportedDrawFunctions().size; ++i) {
        for (const unsigned shift : {PhiloxInput::oneBlock, 0U, 1U, 2U, 3U, 4U, 5U}) {
            input.blockShift = shift;
            std::array<std::uint32_t, groups * wordsPerGroup> words{};
            supportedDrawFunctions().first[i]->drawWords(input, groups, words.data());
            for (std::uint32_t counter = 0; counter < groups * 16; ++counter) {
                const std::uint32_t block = counter >> shift;
                const philox4x32_ctr_t expected = philox4x32(
                    (philox4x32_ctr_t{{input.counter[0] + counter - (block << shift),
                                       input.counter[1] + block, input.counter[2], input.counter[3]}}),
                    (philox4x32_key_t{{input.key[0], input.key[1]}}));
                for (std::size_t j = 0; j < 4; ++j) {
                    ASSERT_EQ(words[counter / 16 * wordsPerGroup + 16 * j + counter % 16], expected.v[j]);
                }
            }
        }
    }
}

TEST(RandomSource, GivesOtherNumbersForEveryPartOfTheName) {
    std::vector<BlockName> names(14, name);
    names[1].seed ^= 1;
    names[2].seed ^= std::uint64_t{1} << 40;
    names[3].blockSize = 1088;
    names[4].ebN0.micro += 1;
    names[5].ebN0.micro = -names[5].ebN0.micro;
    names[6].block += 1;
    names[7].block += std::uint64_t{1} << 32;
    names[8].transmission = 31;
    names[9].repetition = 1;
    names[10].transportBlock = (1U << 19U) - 1;
    names[11].transportBlock = 1024;
    names[12] = names[11];
    names[12].codeBlock = 1;
    names[13] = names[12];
    names[13].codeBlock = 1023;
    std::set<std::uint32_t> seen;
    for (const BlockName& block : names) {
        for (const Purpose purpose : {Purpose::informationBits, Purpose::noise, Purpose::refinement,
                                      Purpose::fading, Purpose::fadingRefinement}) {
            const std::vector<std::uint32_t> words = wordsOf(block, purpose);
            seen.insert(words.begin(), words.begin() + 4);
        }
    }
    EXPECT_EQ(seen.size(), names.size() * 5 * 4);
}

TEST(RandomSource, GivesTheCodeBlocksOfATransmissionSomethingInCommon) {
    BlockName block = name;
    block.transportBlock = 20000;
    block.codeBlock = 2;
    std::vector<std::uint32_t> common(wordsPerGroup);
    RandomSource(block).ofTransmission().words(Purpose::fading, 0, 1, common.data());
    block.codeBlock = 0;
    EXPECT_EQ(common, wordsOf(block, Purpose::fading));
}

TEST(RandomSource, GivesAGroupWhereverTheCallerBegins) {
    std::vector<std::uint32_t> all(8 * wordsPerGroup);
    const RandomSource source(name);
    source.words(Purpose::noise, 0, 8, all.data());
    std::vector<std::uint32_t> one(wordsPerGroup);
    for (std::uint32_t group = 0; group < 8; ++group) {
        source.words(Purpose::noise, group, 1, one.data());
        EXPECT_TRUE(std::equal(one.begin(), one.end(), all.begin() + group * wordsPerGroup));
    }
}

TEST(RandomSource, DrawsTheInformationBitsOfAnOctetFromTheWordsOfItsBlocks) {
    for (const std::uint32_t K : {40U, 72U, 128U, 512U, 528U, 1024U, 6144U}) {
        BlockName block = name;
        block.blockSize = K;
        block.block = (std::uint64_t{1} << 33) - 3;
        std::vector<std::uint8_t> octet(K);
        RandomSource(block).octetBits(octet.data());
        for (unsigned lane = 0; lane < blocksPerOctet; ++lane) {
            block.block = block.block / blocksPerOctet * blocksPerOctet + lane;
            const RandomSource source(block);
            std::vector<std::uint32_t> words(4 * wordsPerGroup);
            source.words(Purpose::informationBits, 0, 4, words.data());
            std::vector<std::uint8_t> bits(K);
            source.informationBits(bits.data());
            for (std::size_t i = 0; i < K; ++i) {
                ASSERT_EQ(bits[i], words[i / 32] >> i % 32 & 1U);
                ASSERT_EQ(bits[i], octet[i] >> lane & 1U);
            }
            const auto ones = static_cast<double>(std::count(bits.begin(), bits.end(), 1));
            EXPECT_NEAR(ones, K / 2.0, 2.5 * std::sqrt(K));  // the numbers are always the same; five sigma
        }
    }
}

TEST(RandomSource, DrawsTheWordsOfAnOctetAsThoseOfItsBlocks) {
    BlockName block = name;
    block.block = (std::uint64_t{1} << 32) + 13;
    const RandomSource source(block);
    EXPECT_EQ(source.lane(), 5U);
    for (const std::size_t count : {1U, 2U, 3U, 4U, 9U, 16U, 17U, 64U}) {
        const OctetWords drawn = source.octetWords(Purpose::noise, 7, count);
        for (unsigned lane = 0; lane < blocksPerOctet; ++lane) {
            block.block = (std::uint64_t{1} << 32) + 8 + lane;
            std::vector<std::uint32_t> words(wordsPerGroup);
            RandomSource(block).words(Purpose::noise, 7, 1, words.data());
            EXPECT_TRUE(std::equal(drawn.of(lane), drawn.of(lane) + count, words.begin())) << count;
            std::vector<std::uint32_t> ofLane(wordsPerGroup);
            source.ofLane(lane).words(Purpose::noise, 7, 1, ofLane.data());
            EXPECT_EQ(ofLane, words);
        }
    }
}

}  // namespace
