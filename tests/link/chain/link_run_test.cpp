// SPDX-License-Identifier: MIT
#include "link/chain/link_run.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <numeric>
#include <stdexcept>

#include "link/coding/transport_block.hpp"
#include "link/quantised_channel.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel;
using namespace quarzel::link;
using Bytes = std::vector<std::uint8_t>;

constexpr std::uint64_t noEnd = std::uint64_t{1} << 40;

LinkSetup codeBlocks(std::uint32_t K, std::size_t E, std::vector<unsigned> rvs = {0}) {
    return {K, 0, E, 1, std::move(rvs), {}};
}

LinkSetup transportBlocks(std::uint32_t A, std::size_t G, std::vector<unsigned> rvs = {0}) {
    return {0, A, G, 1, std::move(rvs), {}};
}

Bytes laneOf(std::span<const std::uint8_t> bytes, unsigned lane) {
    Bytes bits(bytes.size());
    std::transform(bytes.begin(), bytes.end(), bits.begin(),
                   [lane](std::uint8_t byte) { return static_cast<std::uint8_t>(byte >> lane & 1U); });
    return bits;
}

/// The information bits of a block, as the receiver puts them together.
Bytes informationOf(const CodedLink& link, const LinkRun& run, std::size_t i) {
    Bytes bits(link.segmentation().B);
    desegment(link.segmentation(), laneOf(run.bits(i), run.lane(i)), bits);
    bits.resize(link.informationBits());
    return bits;
}

TEST(CodedLink, EncodesEightTransportBlocksAsOne) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const std::uint32_t A : {1U, 16U, 17U, 4264U, 6120U, 6121U, 7224U, 20000U}) {
        const std::size_t G = 4 * std::size_t{A} + 200;
        const CodedLink link(transportBlocks(A, G));
        const std::size_t C = link.segmentation().C;
        Bytes together(A);
        std::generate(together.begin(), together.end(), [&] { return static_cast<std::uint8_t>(random()); });
        Bytes blocks(link.segmentation().totalSize());
        Bytes codeBits(link.softValuesBefore(C));
        link.encode(together, blocks, codeBits);
        for (unsigned lane = 0; lane < 8; ++lane) {
            Bytes coded;
            for (std::size_t r = 0; r < C; ++r) {
                Bytes part(link.codeBlock(r).codedBits());
                rateMatch(
                    link.codeBlock(r).matching(), 0,
                    std::span(codeBits).subspan(link.softValuesBefore(r), link.codeBlock(r).softValues()),
                    part);
                coded.insert(coded.end(), part.begin(), part.end());
            }
            ASSERT_EQ(laneOf(coded, lane), encodeTransportBlock(laneOf(together, lane), {G})) << A;
        }
    }
}

TEST(CodedLink, CountsEbN0ByItsRate) {
    EXPECT_EQ(CodedLink(codeBlocks(1024, 0)).rate(), (CodeRate{1, 3}));
    EXPECT_EQ(CodedLink(codeBlocks(1024, 3084)).rate(), (CodeRate{1, 3}));
    EXPECT_EQ(CodedLink(codeBlocks(1024, 2048)).rate(), (CodeRate{1024, 2048}));
    EXPECT_EQ(CodedLink(transportBlocks(4264, 12876)).rate(), (CodeRate{4264, 12876}));
}

TEST(CodedLink, NamesWhatWouldFit) {
    const auto messageOf = [](const LinkSetup& setup) -> std::string {
        try {
            const CodedLink link(setup);
        } catch (const std::invalid_argument& error) {
            return error.what();
        }
        return {};
    };
    EXPECT_EQ(messageOf({}), "a link has either code blocks alone or transport blocks");
    EXPECT_EQ(messageOf({40, 100, 300, 1, {0}, {}}),
              "a link has either code blocks alone or transport blocks");
    EXPECT_EQ(messageOf(codeBlocks(41, 0)), "LTE has no code block of 41 bits; the nearest sizes: 40, 48");
    EXPECT_EQ(messageOf(codeBlocks(40, 0, {})), "there must be 1 to 32 transmissions, not 0");
    EXPECT_EQ(messageOf(codeBlocks(40, 0, std::vector<unsigned>(33))),
              "there must be 1 to 32 transmissions, not 33");
    EXPECT_EQ(messageOf(transportBlocks(1U << 19U, 1000000)),
              "a transport block has at most 524287 bits here, not 524288");
    EXPECT_THAT(messageOf(codeBlocks(40, 81)), testing::HasSubstr("80"));
    EXPECT_THAT(messageOf(transportBlocks(100, 0)), testing::HasSubstr("2"));
}

// The noise belongs to the places of the streams, so nothing is new where nothing is punctured.
TEST(LinkRun, GivesWhatEncoderAndChannelGiveAtRateOneThird) {
    constexpr Decibels ebN0 = {1200000};
    constexpr std::uint64_t seed = 9;
    for (const std::uint32_t K : {40U, 512U, 6144U}) {
        const CodedLink link(codeBlocks(K, 0));
        const auto channel = makeChannel(link.setup().channel, ebN0, link.rate());
        LinkRun run(link, seed);
        run.begin(ebN0, std::vector<std::uint64_t>{3, 7}, 61);
        run.transmit(*channel, 0);
        ASSERT_EQ(run.size(), 13U) << "the last octet is short";
        const Encoder encoder(K);
        const QuantisedChannel plain(link.setup().channel.quantiser, ebN0);
        for (std::size_t i = 0; i < run.size(); ++i) {
            EXPECT_EQ(run.number(i), (i < 8 ? 24 : 48) + i);
            const RandomSource source({seed, K, ebN0, run.number(i)});
            Bytes bits(K);
            source.informationBits(bits.data());
            Bytes streams(3 * encoder.positions());
            encoder.encode(bits.data(), streams.data());
            std::vector<std::int8_t> soft(streams.size());
            plain.transmit(source, streams.data(), 0, soft.size(), soft.data());
            ASSERT_TRUE(std::equal(soft.begin(), soft.end(), run.soft(i, 0).begin(), run.soft(i, 0).end()));
            ASSERT_EQ(bits, laneOf(run.bits(i), run.lane(i)));
        }
    }
}

TEST(LinkRun, DecodesEveryModulationAndFadingWithoutAnErrorWhereThereIsNextToNoNoise) {
    Core core;
    for (const Fading fading : {Fading::none, Fading::perSymbol, Fading::perBlock}) {
        for (const Modulation modulation :
             {Modulation::bpsk, Modulation::qpsk, Modulation::qam16, Modulation::qam64, Modulation::qam256}) {
            for (const Demapping demapping : {Demapping::maxLog, Demapping::exact}) {
                LinkSetup setup = transportBlocks(6500, 24 * 600);
                setup.channel = {modulation, fading, demapping, {}};
                const CodedLink link(setup);
                constexpr Decibels ebN0 = {40000000};
                const auto channel = makeChannel(setup.channel, ebN0, link.rate());
                LinkRun run(link, 1);
                run.begin(ebN0, std::vector<std::uint64_t>{0}, 4);
                run.transmit(*channel, 0);
                run.decode(core, 4, true);
                for (std::size_t i = 0; i < run.size(); ++i) {
                    const Verdict verdict = run.verdict(i, 3);
                    EXPECT_EQ(verdict.wrongBits, 0U);
                    EXPECT_TRUE(verdict.isAccepted);
                }
            }
        }
    }
}

// The receiver of one transport block, from the soft values in the order in which they are sent.
TEST(LinkRun, JudgesAsTheReceiverOfATransportBlockDoes) {
    constexpr int iterations = 3;
    Core core;
    for (const std::uint32_t A : {200U, 6500U}) {
        const std::size_t G = 2 * std::size_t{A};
        const CodedLink link(transportBlocks(A, G));
        const Decibels ebN0 = {A < 1000 ? 2200000 : 2000000};
        const auto channel = makeChannel(link.setup().channel, ebN0, link.rate());
        LinkRun run(link, 5);
        std::vector<std::uint64_t> octets(A < 1000 ? 20 : 3);
        std::iota(octets.begin(), octets.end(), 0);
        run.begin(ebN0, octets, noEnd);
        run.transmit(*channel, 0);
        run.decode(core, iterations, false);
        std::size_t accepted = 0;
        for (std::size_t i = 0; i < run.size(); ++i) {
            std::vector<std::int16_t> received;
            for (std::size_t r = 0; r < link.segmentation().C; ++r) {
                const CodeBlockLink& block = link.codeBlock(r);
                for (std::size_t k = 0; k < block.codedBits(); ++k) {
                    const std::size_t codeBit = (block.matching().start(0) + k) % block.matching().codeBits();
                    received.push_back(run.soft(i, r)[block.matching().places()[codeBit]]);
                }
            }
            SoftBuffers buffers;
            const TransportDecisions decisions =
                decodeTransportBlock(received, A, {G}, core, iterations, buffers);
            const Bytes sent = informationOf(link, run, i);
            std::uint32_t wrong = 0;
            for (std::size_t bit = 0; bit < A; ++bit) {
                wrong += sent[bit] != decisions.bits[bit] ? 1 : 0;
            }
            const Verdict verdict = run.verdict(i, 0);
            EXPECT_EQ(verdict.wrongBits, wrong);
            EXPECT_EQ(verdict.isAccepted, decisions.ok);
            accepted += verdict.isAccepted ? 1 : 0;
        }
        EXPECT_GT(accepted, 0U);
        EXPECT_LT(accepted, run.size());
    }
}

TEST(LinkRun, SendsTheBlocksThatWaitAgainAsIfAllWere) {
    constexpr Decibels ebN0 = {-1000000};
    const CodedLink link(transportBlocks(7000, 7400, {0, 2, 3}));
    const auto channel = makeChannel(link.setup().channel, ebN0, link.rate());
    const std::vector<std::uint64_t> octets = {1, 4};
    LinkRun all(link, 5);
    LinkRun some(link, 5);
    for (LinkRun* run : {&all, &some}) {
        run->begin(ebN0, octets, noEnd);
        run->transmit(*channel, 0);
    }
    some.retain(Bytes{0, 1, 1, 0, 0, 0, 0, 1, 1, 0, 0, 0, 0, 0, 1, 0});
    all.transmit(*channel, 1);
    some.transmit(*channel, 1);
    some.retain(Bytes{1, 1, 0, 1, 1});
    all.transmit(*channel, 2);
    some.transmit(*channel, 2);
    const std::vector<std::size_t> kept = {1, 2, 8, 14};
    ASSERT_EQ(some.size(), kept.size());
    for (std::size_t i = 0; i < kept.size(); ++i) {
        EXPECT_EQ(some.number(i), all.number(kept[i]));
        for (std::size_t r = 0; r < 2; ++r) {
            const auto soft = some.soft(i, r);
            EXPECT_TRUE(std::equal(soft.begin(), soft.end(), all.soft(kept[i], r).begin()));
        }
    }
    Core core;
    some.decode(core, 8, false);
    for (std::size_t i = 0; i < kept.size(); ++i) {
        EXPECT_TRUE(some.verdict(i, 0).isAccepted) << "three times the energy, and a rate of a third";
    }
}

double errorRate(const LinkSetup& setup, Decibels ebN0, std::size_t octetCount) {
    const CodedLink link(setup);
    const auto channel = makeChannel(setup.channel, ebN0, link.rate());
    Core core;
    LinkRun run(link, 1);
    std::vector<std::uint64_t> octets(octetCount);
    std::iota(octets.begin(), octets.end(), 0);
    run.begin(ebN0, octets, noEnd);
    run.transmit(*channel, 0);
    run.decode(core, 6, false);
    double failed = 0;
    for (std::size_t i = 0; i < run.size(); ++i) {
        failed += run.verdict(i, 0).isAccepted ? 0 : 1;
    }
    return failed / static_cast<double>(run.size());
}

// At a code's threshold of about 1 dB, a block fails where its fading takes more than the rest: with a
// probability of 1 - exp(-10^((1 - 10) / 10)) = 0.118 at 10 dB.
TEST(LinkRun, FailsInDeepFadesAsRayleighsDistributionSays) {
    LinkSetup setup = codeBlocks(1024, 0);
    EXPECT_LT(errorRate(setup, {1600000}, 50), 0.03);
    EXPECT_GT(errorRate(setup, {400000}, 50), 0.5);
    setup.channel.fading = Fading::perBlock;
    EXPECT_NEAR(errorRate(setup, {10000000}, 100), 0.118, 0.045);
    setup.channel.fading = Fading::perSymbol;
    EXPECT_LT(errorRate(setup, {10000000}, 10), 0.01);
}

// With all the bandwidth there is, no code gets below (2^e - 1) / e, where e are the information bits of a
// symbol, or those of two symbols with one component. This one stays within 5 dB.
TEST(LinkRun, ComesCloseToTheLimitOfEveryModulationAndNotBelow) {
    const auto binary = codeBlocks(1024, 24 * 80);
    for (const Modulation modulation :
         {Modulation::bpsk, Modulation::qpsk, Modulation::qam16, Modulation::qam64, Modulation::qam256}) {
        LinkSetup setup = binary;
        setup.channel.modulation = modulation;
        const double e = std::max(bitsOfSymbol(modulation), 2U) * 1024 / (24 * 80.0);
        const double limit = 10 * std::log10((std::exp2(e) - 1) / e);
        const auto above = [limit](double dB) { return Decibels{static_cast<int>((limit + dB) * 1e6)}; };
        for (const Demapping demapping : {Demapping::maxLog, Demapping::exact}) {
            setup.channel.demapping = demapping;
            EXPECT_EQ(errorRate(setup, above(0), 20), 1) << bitsOfSymbol(modulation);
            EXPECT_LT(errorRate(setup, above(5), 40), 0.02) << bitsOfSymbol(modulation);
        }
    }
}

TEST(LinkRun, FailsAlikeWithBpskAndQpsk) {
    LinkSetup setup = codeBlocks(1024, 2048);
    const double qpsk = errorRate(setup, {1350000}, 60);
    EXPECT_THAT(qpsk, testing::AllOf(testing::Gt(0.05), testing::Lt(0.95)));
    setup.channel.modulation = Modulation::bpsk;
    EXPECT_EQ(errorRate(setup, {1350000}, 60), qpsk) << "a component of QPSK is BPSK";
}

}  // namespace
