// SPDX-License-Identifier: MIT
#include "link/coding/crc.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "link/coding/coding_setup.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::Bytes;
using quarzel::test::toStandard;
namespace standard = quarzel::test::standard;

struct Case {
    Crc crc;
    const std::vector<int>& powers;
    std::uint32_t check;  ///< of the nine characters "123456789", as catalogues of such codes list it
};

const std::vector<Case>& cases() {
    static const std::vector<Case> all = {{Crc::crc24A, standard::powersOfCrc24A(), 0xcde703},
                                          {Crc::crc24B, standard::powersOfCrc24B(), 0x23ef52},
                                          {Crc::crc16, standard::powersOfCrc16(), 0x31c3},
                                          {Crc::crc8, standard::powersOfCrc8(), 0xea}};
    return all;
}

TEST(Crc, GivesTheCheckValuesOfCatalogues) {
    const Bytes bits = quarzel::test::bitsOfHex("313233343536373839", 72);
    for (const Case& one : cases()) {
        EXPECT_EQ(crcOf(one.crc, bits), one.check);
    }
}

TEST(Crc, IsTheRemainderOfLongDivisionAtEveryLength) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const Case& one : cases()) {
        for (std::size_t size = 0; size < 300; ++size) {
            const Bytes bits = quarzel::test::randomBits(random, size);
            Bytes parity(crcLength(one.crc));
            writeCrc(one.crc, bits, parity);
            ASSERT_EQ(toStandard(parity), standard::parity(toStandard(bits), one.powers)) << size;
        }
    }
}

TEST(Crc, IsWrittenForEightBlocksAtOnce) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const Case& one : cases()) {
        for (std::size_t size = 0; size < 100; ++size) {
            Bytes together(size);
            std::generate(together.begin(), together.end(),
                          [&] { return static_cast<std::uint8_t>(random()); });
            Bytes parity(crcLength(one.crc));
            writeCrc(one.crc, together, parity);
            for (unsigned block = 0; block < 8; ++block) {
                Bytes alone(together.begin(), together.end());
                alone.insert(alone.end(), parity.begin(), parity.end());
                for (std::uint8_t& bit : alone) {
                    bit = bit >> block & 1U;
                }
                ASSERT_TRUE(crcHolds(one.crc, alone)) << size << ' ' << block;
            }
        }
    }
}

TEST(Crc, HoldsUntilOneBitIsWrong) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const Case& one : cases()) {
        Bytes bits = quarzel::test::randomBits(random, 100 + crcLength(one.crc));
        writeCrc(one.crc, std::span(bits).first(100), std::span(bits).subspan(100));
        EXPECT_TRUE(crcHolds(one.crc, bits));
        for (std::uint8_t& bit : bits) {
            bit ^= 1;
            EXPECT_FALSE(crcHolds(one.crc, bits));
            bit ^= 1;
        }
    }
}

TEST(Crc, NamesTheParityBitsThatFit) {
    Bytes parity(23);
    EXPECT_THAT([&] { writeCrc(Crc::crc24A, Bytes(8), parity); },
                testing::ThrowsMessage<std::invalid_argument>("there must be 24 parity bits, not 23"));
}

}  // namespace
