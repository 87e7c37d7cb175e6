// SPDX-License-Identifier: MIT
#include "link/encoder.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <stdexcept>
#include <string>
#include <vector>

#include "quarzel/code.hpp"
#include "support/model.hpp"
#include "support/random.hpp"

namespace {

using quarzel::link::Encoder;
using quarzel::test::Block;
using quarzel::test::genericsOf;
using quarzel::test::makeState;
using quarzel::test::simulate;
using quarzel::test::State;

std::vector<std::uint8_t> encode(const std::vector<std::uint8_t>& bits) {
    const Encoder encoder(static_cast<std::uint32_t>(bits.size()));
    std::vector<std::uint8_t> streams(3 * encoder.positions());
    encoder.encode(bits.data(), streams.data());
    return streams;
}

std::string textOf(const std::vector<std::uint8_t>& streams, std::size_t from, std::size_t size) {
    std::string text;
    for (std::size_t i = from; i < from + size; ++i) {
        text += streams[i] != 0 ? '1' : '0';
    }
    return text;
}

TEST(Encoder, GivesTheZeroCodeWordForZeroBits) {
    EXPECT_THAT(encode(std::vector<std::uint8_t>(40)), testing::Each(0));
}

// Worked by hand from the generator polynomials: the answer to a single 1 at the first step is the impulse
// response of (1 + D + D^3) / (1 + D^2 + D^3), and the QPP of K = 40 leaves index 0 in its place.
TEST(Encoder, AnswersAnImpulseAsTheGeneratorPolynomialsDo) {
    std::vector<std::uint8_t> bits(40);
    bits[0] = 1;
    const std::vector<std::uint8_t> streams = encode(bits);
    EXPECT_EQ(textOf(streams, 0, 10), "1000000000");
    EXPECT_EQ(textOf(streams, 44, 10), "1111001011");
    EXPECT_EQ(textOf(streams, 88, 10), "1111001011");
}

TEST(Encoder, EncodesEightBlocksSideBySide) {
    std::mt19937 random = quarzel::test::seededRandom();
    std::vector<std::uint8_t> all(1024);
    std::generate(all.begin(), all.end(), [&] { return static_cast<std::uint8_t>(random()); });
    const std::vector<std::uint8_t> allStreams = encode(all);
    for (unsigned lane = 0; lane < 8; ++lane) {
        const auto laneOf = [lane](std::vector<std::uint8_t> bytes) {
            for (std::uint8_t& byte : bytes) {
                byte = byte >> lane & 1U;
            }
            return bytes;
        };
        EXPECT_EQ(encode(laneOf(all)), laneOf(allStreams)) << lane;
    }
}

TEST(Encoder, RefusesASizeThatLteDoesNotHave) {
    EXPECT_THROW(Encoder(41), std::invalid_argument);
    EXPECT_THROW(Encoder(0), std::invalid_argument);
}

// A core that decodes a noiseless code word gives the bits back.
TEST(Encoder, IsUndoneByEveryCoreForAllBlockSizes) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const int units : {2, 4, 8}) {
        for (const int algorithm : {0, 1, 2}) {
            const State state = makeState(genericsOf(units, 8, algorithm));
            for (const quarzel::BlockSize& params : quarzel::blockSizes()) {
                std::vector<std::uint8_t> bits(params.K);
                std::generate(bits.begin(), bits.end(),
                              [&] { return static_cast<std::uint8_t>(random() & 1U); });
                const std::vector<std::uint8_t> streams = encode(bits);
                const std::size_t positions = params.K + 4;
                Block block(positions);
                for (std::size_t i = 0; i < positions; ++i) {
                    block.systematic[i] = streams[i] != 0 ? 64 : -64;
                    block.parity1[i] = streams[positions + i] != 0 ? 64 : -64;
                    block.parity2[i] = streams[2 * positions + i] != 0 ? 64 : -64;
                }
                auto result = simulate(state.get(), block.inputs());
                ASSERT_EQ(result.status, 0);
                result.bits.resize(params.K);
                ASSERT_EQ(result.bits, bits)
                    << "K " << params.K << ", " << units << " units, type " << algorithm;
            }
        }
    }
}

}  // namespace
