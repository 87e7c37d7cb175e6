// SPDX-License-Identifier: MIT
#include "link/chain/code_block_link.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <numeric>
#include <set>
#include <stdexcept>

#include "link/coding/rate_recovery.hpp"
#include "link/coding/turbo_encoding.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;

constexpr Decibels ebN0 = {1000000};
const std::vector<unsigned> versions = {0, 2, 3, 1, 0};

std::vector<std::uint8_t> randomBytes(std::mt19937& random, std::size_t size) {
    std::vector<std::uint8_t> bytes(size);
    std::generate(bytes.begin(), bytes.end(), [&] { return static_cast<std::uint8_t>(random()); });
    return bytes;
}

/// The soft values of the coded bits of a transmission, one after another. Sent in the order of the streams,
/// the bits that are sent for the first time have random numbers of their own, then those for the second
/// time.
std::vector<std::int8_t> receive(const CodeBlockLink& link, CodeBlockLink::Order order,
                                 const Channel& channel, BlockName name,
                                 const std::vector<std::uint8_t>& streams, unsigned lane) {
    const auto places = link.matching().places();
    const std::size_t start = link.matching().start(versions[name.transmission]);
    std::vector<std::int8_t> soft(link.codedBits());
    std::vector<std::size_t> left(soft.size());  // numbers of coded bits
    std::iota(left.begin(), left.end(), 0);
    const auto placeOf = [&](std::size_t i) { return places[(start + i) % places.size()]; };
    while (!left.empty()) {
        std::vector<std::size_t> now;
        std::vector<std::size_t> later;
        std::set<std::uint16_t> seen;
        for (const std::size_t i : left) {
            const bool isNow = order == CodeBlockLink::Order::sent || seen.insert(placeOf(i)).second;
            (isNow ? now : later).push_back(i);
        }
        if (order == CodeBlockLink::Order::streams) {
            std::sort(now.begin(), now.end(),
                      [&](std::size_t a, std::size_t b) { return placeOf(a) < placeOf(b); });
        }
        std::vector<std::uint8_t> coded;
        for (const std::size_t i : now) {
            coded.push_back(streams[placeOf(i)]);
        }
        std::vector<std::int8_t> received(coded.size());
        channel.transmit(RandomSource(name), coded.data(), lane, coded.size(), received.data());
        for (std::size_t k = 0; k < now.size(); ++k) {
            soft[now[k]] = received[k];
        }
        left = later;
        ++name.repetition;
    }
    return soft;
}

TEST(CodeBlockLink, CombinesWhatRateRecoveryCombines) {
    std::mt19937 random = quarzel::test::seededRandom();
    struct Way {
        ChannelSetup channel;
        CodeBlockLink::Order order;
    };
    const std::vector<Way> ways = {
        {{Modulation::qpsk, Fading::none, Demapping::maxLog, {}}, CodeBlockLink::Order::streams},
        {{Modulation::qpsk, Fading::none, Demapping::maxLog, {}}, CodeBlockLink::Order::sent},
        {{Modulation::qam16, Fading::none, Demapping::maxLog, {}}, CodeBlockLink::Order::sent},
        {{Modulation::qpsk, Fading::perSymbol, Demapping::maxLog, {}}, CodeBlockLink::Order::sent}};
    for (const auto& [setup, order] : ways) {
        const auto channel = makeChannel(setup, ebN0, {});
        for (const std::uint32_t K : {40U, 104U, 1024U}) {
            for (const std::size_t filler : {0U, 1U, 17U}) {
                const std::size_t codeBits = RateMatching(K, filler).codeBits();
                const std::size_t whole = codeBits / 4 * 4;
                for (const std::size_t E : {std::size_t{4}, std::size_t{K}, whole, whole + 4, 3 * whole}) {
                    const CodeBlockLink link(K, filler, E, versions, order);
                    const unsigned lane = random() % 8;
                    std::vector<std::uint8_t> streams(link.softValues());
                    turboEncode(link.encoder(), randomBytes(random, K), filler, streams);
                    std::vector<std::int16_t> buffer(codeBits);
                    std::vector<std::int8_t> expected(link.softValues());
                    std::vector<std::int8_t> soft(link.softValues(), 99);
                    std::vector<std::uint8_t> coded(E);
                    std::vector<std::int8_t> received(E);
                    BlockName name = {random(), K, ebN0, random()};
                    for (std::uint32_t t = 0; t < versions.size(); ++t) {
                        name.transmission = t;
                        rateRecover(link.matching(), versions[t],
                                    receive(link, order, *channel, name, streams, lane), buffer);
                        readStreams(link.matching(), buffer, expected);
                        link.select(t, streams.data(), coded.data());
                        link.send(*channel, name, coded.data(), lane, received.data(), soft.data());
                        ASSERT_EQ(soft, expected) << K << ' ' << filler << ' ' << E << ' ' << t;
                    }
                }
            }
        }
    }
}

TEST(CodeBlockLink, NamesTheSizesThatFit) {
    EXPECT_THAT([] { CodeBlockLink(40, 0, 2113, versions, CodeBlockLink::Order::sent); },
                testing::ThrowsMessage<std::invalid_argument>(
                    "a code block of 40 bits is sent as at most 2112 coded bits here, not 2113"));
    EXPECT_NO_THROW(CodeBlockLink(40, 0, 2112, versions, CodeBlockLink::Order::sent));
    EXPECT_THROW(CodeBlockLink(40, 0, 0, versions, CodeBlockLink::Order::sent), std::invalid_argument);
    EXPECT_THROW(CodeBlockLink(41, 0, 80, versions, CodeBlockLink::Order::sent), std::invalid_argument);
    EXPECT_THROW(CodeBlockLink(40, 0, 80, std::vector<unsigned>{4}, CodeBlockLink::Order::sent),
                 std::invalid_argument);
}

}  // namespace
