// SPDX-License-Identifier: MIT
#include "link/quantised_channel.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <random>
#include <vector>

#include "link/soft_counts.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::Against;
using quarzel::test::Counts;
using quarzel::test::deviation;

struct Channel {
    Quantiser quantiser;
    Decibels ebN0;
};

/// From hardly any noise to much, from few outputs to clipping nearly everything.
const std::vector<Channel> channels = {
    {{Quantiser::Kind::llr, 4}, {600000}},
    {{Quantiser::Kind::amplitude, 8}, {0}},
    {{Quantiser::Kind::amplitude, 0.4}, {0}},
    {{Quantiser::Kind::amplitude, 127}, {1000000}},
    {{Quantiser::Kind::amplitude, 5000}, {-3000000}},
    {{Quantiser::Kind::llr, 16}, {10000000}},
};

constexpr std::uint32_t K = 6144;
constexpr std::size_t codeBits = 3 * (K + 4);

Counts drawn(const Channel& channel, bool codeBit, std::uint64_t seed, std::size_t blocks) {
    const QuantisedChannel quantised(channel.quantiser, channel.ebN0);
    const std::vector<std::uint8_t> bits(codeBits, codeBit ? 1 : 0);
    std::vector<std::int8_t> soft(codeBits);
    Counts counts{};
    for (std::size_t block = 0; block < blocks; ++block) {
        quantised.transmit(RandomSource({seed, K, channel.ebN0, block}), bits.data(), 0, codeBits,
                           soft.data());
        for (const std::int8_t value : soft) {
            counts.at(quarzel::test::placeOf(value)) += 1;
        }
    }
    return counts;
}

TEST(QuantisedChannel, DrawsTheExactDistribution) {
    const std::uint64_t seed = quarzel::test::seededRandom()();
    constexpr std::size_t blocks = 40;
    for (const Channel& channel : channels) {
        for (const bool codeBit : {false, true}) {
            const QuantisedChannel quantised(channel.quantiser, channel.ebN0);
            Counts expected{};
            double total = 0;
            for (int soft = -128; soft <= 127; ++soft) {
                const double probability = quantised.probability(soft, codeBit);
                total += probability;
                expected.at(static_cast<std::size_t>(soft + 128)) = probability * codeBits * blocks;
            }
            EXPECT_NEAR(total, 1, 1e-14);
            EXPECT_LT(deviation(drawn(channel, codeBit, seed, blocks), expected, Against::mean), 5)
                << channel.quantiser.scale << ' ' << codeBit;
        }
    }
}

// What the channel replaces: a Gaussian number, and the quantiser in floating point.
TEST(QuantisedChannel, DrawsWhatAGaussianSourceAndARoundingQuantiserGive) {
    std::mt19937 random = quarzel::test::seededRandom();
    constexpr std::size_t blocks = 20;
    for (const Channel& channel : channels) {
        const double variance = 1.5 * std::pow(10, -channel.ebN0.value() / 10);
        const double units =
            channel.quantiser.scale * (channel.quantiser.kind == Quantiser::Kind::llr ? 2 / variance : 1.0);
        std::normal_distribution<double> received(-1, std::sqrt(variance));
        Counts plain{};
        for (std::size_t i = 0; i < blocks * codeBits; ++i) {
            const double soft = std::clamp(std::round(units * received(random)), -128.0, 127.0);
            plain.at(static_cast<std::size_t>(soft + 128)) += 1;
        }
        EXPECT_LT(deviation(drawn(channel, false, random(), blocks), plain, Against::draw), 5)
            << channel.quantiser.scale;
    }
}

// The outputs of a 16-bit random number, one threshold after another, must not depend on how cells are cut.
TEST(QuantisedChannel, GivesTheSameOutputsWithEveryInstructionSet) {
    std::mt19937 random = quarzel::test::seededRandom();
    std::vector<std::int32_t> cells(cellCount);
    for (std::int32_t& cell : cells) {
        const auto value = static_cast<std::int32_t>(random() % 257) - 128;
        const auto place = static_cast<std::int32_t>(random() % 17);
        cell = value * 256 + (place == 16 ? cellNoThreshold : place) +
               (random() % 50 == 0 ? cellManyThresholds : 0);
    }
    constexpr std::size_t times = 64;
    std::vector<std::uint32_t> words(times * valuesPerLookUp / 2);
    std::vector<std::uint8_t> bits(times * valuesPerLookUp);
    std::generate(words.begin(), words.end(), [&] { return static_cast<std::uint32_t>(random()); });
    std::generate(bits.begin(), bits.end(), [&] { return static_cast<std::uint8_t>(random()); });
    struct Outputs {
        std::vector<std::int8_t> soft;
        std::vector<std::uint32_t> undecided;
        bool operator==(const Outputs&) const = default;
    };
    std::vector<Outputs> outputs;
    for (std::size_t i = 0; i < supportedDrawFunctions().size; ++i) {
        Outputs& now = outputs.emplace_back(
            Outputs{std::vector<std::int8_t>(bits.size()), std::vector<std::uint32_t>(times)});
        supportedDrawFunctions().first[i]->lookUp(words.data(), bits.data(), 3, cells.data(), times,
                                                  now.soft.data(), now.undecided.data());
        EXPECT_TRUE(now == outputs.front()) << i;
    }
    EXPECT_THAT(outputs.front().undecided, testing::Contains(testing::Ne(0U)));
    EXPECT_THAT(outputs.front().undecided, testing::Each(testing::Ne(~0U)));
}

// Searches in registers and look-ups, with outputs from few to too many for a search.
TEST(QuantisedChannel, TransmitsTheSameWithEveryInstructionSet) {
    std::mt19937 random = quarzel::test::seededRandom();
    std::vector<std::uint8_t> bits(codeBits);
    std::generate(bits.begin(), bits.end(), [&] { return static_cast<std::uint8_t>(random()); });
    for (const Quantiser::Kind kind : {Quantiser::Kind::llr, Quantiser::Kind::amplitude}) {
        for (double scale = 0.01; scale < 1000; scale *= 1.3) {
            const Decibels ebN0 = {static_cast<std::int32_t>(random() % 12000000) - 2000000};
            const RandomSource source({random(), K, ebN0, 1});
            const auto lane = static_cast<unsigned>(random() % 8);
            const std::size_t count = codeBits - random() % 2000;
            const auto sentWith = [&](const DrawFunctions& draw) {
                std::vector<std::int8_t> soft(codeBits, -77);
                QuantisedChannel({kind, scale}, ebN0, {}, draw)
                    .transmit(source, bits.data(), lane, count, soft.data());
                return soft;
            };
            const DrawFunctionsList list = supportedDrawFunctions();
            const std::vector<std::int8_t> expected = sentWith(*list.first[list.size - 1]);
            for (std::size_t i = 0; i + 1 < list.size; ++i) {
                EXPECT_TRUE(sentWith(*list.first[i]) == expected) << scale << ' ' << ebN0.micro << ' ' << i;
            }
        }
    }
}

// Counts that leave none, few and many values over a whole group of words.
TEST(QuantisedChannel, TransmitsAnOctetAsItsBlocks) {
    std::mt19937 random = quarzel::test::seededRandom();
    std::vector<std::uint8_t> bits(codeBits);
    std::generate(bits.begin(), bits.end(), [&] { return static_cast<std::uint8_t>(random()); });
    for (const Channel& channel : channels) {
        const RandomSource source({random(), K, channel.ebN0, random()});
        for (std::size_t i = 0; i < supportedDrawFunctions().size; ++i) {
            const QuantisedChannel quantised(channel.quantiser, channel.ebN0, {},
                                             *supportedDrawFunctions().first[i]);
            for (const std::size_t count : {1U, 12U, 128U, 132U, 140U, 144U, 145U, 1036U, 3084U}) {
                std::vector<std::int8_t> octet(blocksPerOctet * count);
                quantised.transmitOctet(source, bits.data(), count, octet.data());
                for (unsigned lane = 0; lane < blocksPerOctet; ++lane) {
                    std::vector<std::int8_t> soft(count);
                    quantised.transmit(source.ofLane(lane), bits.data(), lane, count, soft.data());
                    ASSERT_TRUE(std::equal(soft.begin(), soft.end(), octet.data() + lane * count))
                        << channel.quantiser.scale << ' ' << i << ' ' << count << ' ' << lane;
                }
            }
        }
    }
}

TEST(QuantisedChannel, GivesAValueThatDependsOnItsOwnBitAlone) {
    const Channel& channel = channels[0];
    const QuantisedChannel quantised(channel.quantiser, channel.ebN0);
    const RandomSource source({7, K, channel.ebN0, 3});
    std::vector<std::uint8_t> bits(codeBits);
    std::vector<std::int8_t> whole(codeBits);
    std::mt19937 random = quarzel::test::seededRandom();
    std::generate(bits.begin(), bits.end(), [&] { return static_cast<std::uint8_t>(random()); });
    quantised.transmit(source, bits.data(), 6, codeBits, whole.data());
    for (const std::size_t count : {1U, 31U, 32U, 132U, 1025U}) {
        std::vector<std::int8_t> part(count + 1, -77);
        quantised.transmit(source, bits.data(), 6, count, part.data());
        EXPECT_TRUE(std::equal(part.begin(), part.end() - 1, whole.begin()));
        EXPECT_EQ(part.back(), -77) << "nothing beyond may be written";
    }
    std::vector<std::uint8_t> others(codeBits);
    std::transform(bits.begin(), bits.end(), others.begin(),
                   [](std::uint8_t bit) { return static_cast<std::uint8_t>(bit ^ 0x40U); });
    std::vector<std::int8_t> opposite(codeBits);
    quantised.transmit(source, others.data(), 6, codeBits, opposite.data());
    for (std::size_t i = 0; i < codeBits; ++i) {
        // -128 and 127 stand for more than one value before clipping.
        ASSERT_EQ(std::clamp(-whole[i], -127, 127), std::max<int>(opposite[i], -127)) << i;
    }
}

}  // namespace
