// SPDX-License-Identifier: MIT
#include "link/coding/turbo_encoding.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "link/coding/coding_setup.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::Bytes;
using quarzel::test::toStandard;
namespace standard = quarzel::test::standard;

void expectAsInTheStandard(std::mt19937& random, int K, int filler) {
    const Encoder encoder(static_cast<std::uint32_t>(K));
    Bytes block = quarzel::test::randomBits(random, encoder.blockSize());
    std::fill_n(block.begin(), filler, nullBit);
    Bytes streams(3 * encoder.positions());
    turboEncode(encoder, block, static_cast<std::size_t>(filler), streams);
    standard::Bits expected;
    for (const standard::Bits& stream : standard::turboCode(toStandard(block))) {
        expected.insert(expected.end(), stream.begin(), stream.end());
    }
    ASSERT_EQ(toStandard(streams), expected) << "K " << K << ", filler " << filler;
}

TEST(TurboEncoding, IsThatOfTheStandardForAllBlockSizesAndFillerCounts) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (std::size_t i = 0; i < standard::blockSizes().size(); ++i) {
        std::vector<int> fillers = {0, standard::fillers()[i].back()};
        if (quarzel::test::isExhaustive()) {
            fillers = standard::fillers()[i];
        }
        for (const int filler : fillers) {
            expectAsInTheStandard(random, standard::blockSizes()[i], filler);
        }
    }
}

TEST(TurboEncoding, NamesTheSizesThatFit) {
    using testing::ThrowsMessage;
    const Encoder encoder(40);
    Bytes block(40);
    Bytes streams(132);
    EXPECT_THAT([&] { turboEncode(encoder, Bytes(41), 0, streams); },
                ThrowsMessage<std::invalid_argument>("there must be 40 bits of a code block, not 41"));
    EXPECT_THAT([&] { turboEncode(encoder, block, 0, block); },
                ThrowsMessage<std::invalid_argument>("there must be 132 code bits, not 40"));
    EXPECT_THAT([&] { turboEncode(encoder, block, 40, streams); },
                ThrowsMessage<std::invalid_argument>("a block of 40 bits has 0 to 39 filler bits, not 40"));
}

}  // namespace
