// SPDX-License-Identifier: MIT
#include "link/coding/transport_block.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "link/coding/coded_sizes.hpp"
#include "link/coding/coding_setup.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::Bytes;
using quarzel::test::fromStandard;
using quarzel::test::randomBelow;
using quarzel::test::randomBits;
using quarzel::test::toStandard;
using testing::ThrowsMessage;
namespace standard = quarzel::test::standard;

using Soft = std::vector<std::int16_t>;

constexpr int iterations = 8;

/// What a receiver has of coded bits without noise.
Soft received(const Bytes& coded) {
    Soft soft;
    for (const std::uint8_t bit : coded) {
        soft.push_back(bit != 0 ? 20 : -20);
    }
    return soft;
}

/// A transport block that is cut into C code blocks.
Bytes randomBlock(std::mt19937& random, std::size_t C) {
    const auto size = C == 1 ? 1 + randomBelow(random, 6120)
                             : static_cast<int>(C - 1) * 6120 + 1 + randomBelow(random, 6120 - 24);
    return randomBits(random, static_cast<std::size_t>(size));
}

/// A transmission of about so many coded bits.
Transmission transmissionOf(std::mt19937& random, std::size_t codedBits) {
    Transmission transmission{0};
    transmission.Qm = std::vector{1U, 2U, 4U, 6U, 8U}[static_cast<std::size_t>(randomBelow(random, 5))];
    transmission.layers = 1 + static_cast<unsigned>(randomBelow(random, 4));
    transmission.rv = static_cast<unsigned>(randomBelow(random, 4));
    const std::size_t unit = transmission.Qm * transmission.layers;
    transmission.G = (codedBits / unit + 1) * unit;
    return transmission;
}

TEST(TransportBlock, IsEncodedAsInTheStandard) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (std::size_t C = 1; C <= 13; ++C) {
        const Bytes bits = randomBlock(random, C);
        const Transmission transmission = transmissionOf(random, bits.size() * 2 + 300);
        EXPECT_EQ(
            encodeTransportBlock(bits, transmission),
            fromStandard(standard::encode(
                toStandard(bits), static_cast<int>(transmission.G), static_cast<int>(transmission.layers),
                static_cast<int>(transmission.Qm), static_cast<int>(transmission.rv))))
            << bits.size();
    }
}

TEST(TransportBlock, ComesBackFromOneTransmissionWithoutNoise) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (std::size_t C = 1; C <= 13; ++C) {
        const Bytes bits = randomBlock(random, C);
        Transmission transmission = transmissionOf(random, bits.size() * 3 + 400);
        quarzel::Core core;
        SoftBuffers buffers;
        const TransportDecisions decisions =
            decodeTransportBlock(received(encodeTransportBlock(bits, transmission)), bits.size(),
                                 transmission, core, iterations, buffers);
        EXPECT_TRUE(decisions.ok);
        EXPECT_EQ(decisions.bits, bits);
        EXPECT_EQ(decisions.blocksOk, std::vector<bool>(C, true));
    }
}

// Each transmission alone has fewer coded bits than the block has bits, so it cannot be enough.
TEST(TransportBlock, ComesBackFromTwoTransmissionsWhenOneIsNotEnough) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const std::size_t C : {1U, 2U, 5U}) {
        Bytes bits = randomBlock(random, C);
        bits.resize(std::max<std::size_t>(bits.size(), 500));
        const TransportBlockCode code(bits.size());
        Transmission transmission{bits.size() * 9 / 10 / 2 * 2};
        quarzel::Core core;
        SoftBuffers buffers;
        Bytes coded(transmission.G);
        code.encode(bits, transmission, coded);
        EXPECT_FALSE(code.decode(received(coded), transmission, core, iterations, buffers).ok);
        EXPECT_EQ(buffers.values.size(), code.softValues());

        transmission.rv = 2;
        code.encode(bits, transmission, coded);
        const TransportDecisions decisions =
            code.decode(received(coded), transmission, core, iterations, buffers);
        EXPECT_TRUE(decisions.ok);
        EXPECT_EQ(decisions.bits, bits);
    }
}

TEST(TransportBlock, UsesTheLimitedBufferOfTheReceiver) {
    std::mt19937 random = quarzel::test::seededRandom();
    const Bytes bits = randomBits(random, 51024);
    const std::size_t NIR = softBits({.Nsoft = 1237248, .KMIMO = 2});
    const TransportBlockCode code(bits.size(), NIR);
    EXPECT_EQ(code.segmentation().C, 9);
    EXPECT_EQ(code.matching(0).bufferSize(), 77328 / 9);
    const Transmission transmission{90000, 6, 1, 3};
    quarzel::Core core;
    SoftBuffers buffers;
    const TransportDecisions decisions =
        decodeTransportBlock(received(encodeTransportBlock(bits, transmission, NIR)), bits.size(),
                             transmission, core, iterations, buffers, NIR);
    EXPECT_TRUE(decisions.ok);
    EXPECT_EQ(decisions.bits, bits);
}

TEST(TransportBlock, TellsWhichCodeBlockIsLost) {
    std::mt19937 random = quarzel::test::seededRandom();
    const Bytes bits = randomBits(random, 17000);
    const Transmission transmission{51600};
    Soft soft = received(encodeTransportBlock(bits, transmission));
    std::fill(soft.begin() + 17200, soft.begin() + 34400, std::int16_t{0});
    quarzel::Core core;
    SoftBuffers buffers;
    const TransportDecisions decisions =
        decodeTransportBlock(soft, bits.size(), transmission, core, iterations, buffers);
    EXPECT_FALSE(decisions.ok);
    EXPECT_EQ(decisions.blocksOk, (std::vector<bool>{true, false, true}));
}

TEST(TransportBlock, NamesWhatFits) {
    const auto expect = [](auto call, const char* message) {
        EXPECT_THAT(call, ThrowsMessage<std::invalid_argument>(message));
    };
    expect([] { TransportBlockCode(0); }, "a transport block has at least 1 bit, not 0");
    expect([] { TransportBlockCode(100, 0); },
           "the circular buffer of a block of 128 bits, 4 of them filler, has 2 to 480 entries, not 0");
    expect(
        [] {
            encodeTransportBlock(Bytes(100), {300, 2, 1, 4});
        },
        "the redundancy version must be 0 to 3, not 4");
    expect([] { encodeTransportBlock(Bytes(100), {0}); },
           "the code blocks need at least 2 coded bits, not 0");
    expect([] { encodeTransportBlock(Bytes(100, 2), {300}); },
           "the bits of a transport block must be 0 or 1");
    quarzel::Core core;
    SoftBuffers buffers;
    expect([&] { decodeTransportBlock(Soft(299), 100, {300}, core, iterations, buffers); },
           "there must be 300 soft values, not 299");
    buffers.values.resize(100);
    expect([&] { decodeTransportBlock(Soft(300), 100, {300}, core, iterations, buffers); },
           "there must be 388 values in the soft buffers of this transport block, not 100");
}

}  // namespace
