// SPDX-License-Identifier: MIT
#include "link/bit_errors.hpp"

#include <gtest/gtest.h>

#include <vector>

#include "support/random.hpp"

namespace {

TEST(BitErrors, AreCountedAtEveryLength) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const std::size_t size : {0U, 1U, 7U, 8U, 9U, 63U, 2039U, 2040U, 2041U, 6144U, 12345U}) {
        for (const unsigned lane : {0U, 5U, 7U}) {
            std::vector<std::uint8_t> sent(size);
            std::vector<std::uint8_t> decided(size);
            std::uint32_t wrong = 0;
            for (std::size_t i = 0; i < size; ++i) {
                sent[i] = static_cast<std::uint8_t>(random());
                decided[i] = random() % 5 != 0 ? 1 : 0;
                wrong += decided[i] != (sent[i] >> lane & 1U) ? 1 : 0;
            }
            EXPECT_EQ(quarzel::link::bitErrors(sent.data(), lane, decided.data(), size), wrong) << size;
            for (std::size_t i = 0; i < size; ++i) {
                decided[i] = (sent[i] >> lane & 1U) ^ 1U;
            }
            EXPECT_EQ(quarzel::link::bitErrors(sent.data(), lane, decided.data(), size), size);
        }
    }
}

}  // namespace
