// SPDX-License-Identifier: MIT
// The modulo arithmetic of metrics, against integers that do not wrap.
#include "fixed/wrap16.hpp"

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "support/random.hpp"

namespace quarzel::test {
namespace {

/// The signed word that is congruent to a value modulo 2^16.
constexpr int congruentWord(std::int64_t value) {
    while (value > 32767) {
        value -= 65536;
    }
    while (value < -32768) {
        value += 65536;
    }
    return static_cast<int>(value);
}

constexpr std::int16_t word(int value) {
    return static_cast<std::int16_t>(value);
}

/// The ends and the middle of the range, and random words.
std::vector<std::int16_t> bases() {
    std::vector<std::int16_t> words = {0, 1, -1, 32767, -32768, 32766, -32767, 16384, -16384, 16383, -16385};
    std::mt19937 random = seededRandom();
    while (words.size() < 48) {
        words.push_back(randomWord(random));
    }
    return words;
}

TEST(Wrap16, KeepsTheLow16Bits) {
    for (int value = -200000; value <= 200000; ++value) {
        ASSERT_EQ(wrap16(value), congruentWord(value));
    }
    EXPECT_EQ(wrap16(INT32_MAX), -1);
    EXPECT_EQ(wrap16(INT32_MIN), 0);
    EXPECT_EQ(wrap16(INT32_MIN + 32768), -32768);
}

TEST(Wrap16, AddsAndSubtractsModulo65536) {
    for (const std::int16_t x : bases()) {
        for (int y = -32768; y <= 32767; ++y) {
            ASSERT_EQ(add(x, word(y)), congruentWord(x + y)) << x << " + " << y;
            ASSERT_EQ(sub(x, word(y)), congruentWord(x - y)) << x << " - " << y;
            ASSERT_EQ(sub(word(y), x), congruentWord(y - x)) << y << " - " << x;
        }
    }
}

TEST(Wrap16, ChoosesTheSecondForANegativeDifferenceAlone) {
    for (int difference = -32768; difference <= 32767; ++difference) {
        ASSERT_EQ(chooseBySign(word(difference), 1, 2), difference < 0 ? 2 : 1) << difference;
    }
}

TEST(ModuloMaximum, FollowsItsDefinitionForEveryDifference) {
    for (const std::int16_t x : bases()) {
        for (int y = -32768; y <= 32767; ++y) {
            const int expected = congruentWord(x - y) < 0 ? y : x;
            ASSERT_EQ(moduloMax(x, word(y)), expected) << x << ", " << y;
        }
    }
}

TEST(ModuloMaximum, KeepsItsChoiceWhenBothCandidatesMoveAroundTheCircle) {
    for (const int difference : {0, 1, -1, 255, -255, 32767, -32767, -32768}) {
        for (int x = -32768; x <= 32767; ++x) {
            const std::int16_t y = word(congruentWord(x - difference));
            ASSERT_EQ(moduloMax(word(x), y), difference < 0 ? y : x) << x << ", " << y;
        }
    }
}

TEST(ModuloMaximum, IsDecidedByTheWrapAndNotByTheSizeOfTheNumbers) {
    EXPECT_EQ(moduloMax(word(28672), word(-28672)), -28672);
    EXPECT_EQ(moduloMax(word(-28672), word(28672)), -28672);
    EXPECT_EQ(moduloMax(word(16383), word(-16384)), 16383);
    EXPECT_EQ(moduloMax(word(16384), word(-16384)), -16384);
}

TEST(ModuloMaximum, TakesItsSecondCandidateAtHalfTheCircleInEitherOrder) {
    EXPECT_EQ(moduloMax(word(0), word(-32768)), -32768);
    EXPECT_EQ(moduloMax(word(-32768), word(0)), 0);
    EXPECT_EQ(moduloMax(word(16384), word(-16384)), -16384);
    EXPECT_EQ(moduloMax(word(-16384), word(16384)), 16384);
}

TEST(BoundaryMask, ClearsTheLow7Bits) {
    for (int metric = -32768; metric <= 32767; ++metric) {
        const int kept = metric & boundaryMask;
        ASSERT_TRUE(kept % 128 == 0 && metric - kept >= 0 && metric - kept < 128) << metric;
    }
}

}  // namespace
}  // namespace quarzel::test
