// SPDX-License-Identifier: MIT
// Vectors of others: tests/data/README.md names their source.
#include <gtest/gtest.h>

#include "link/coding/coding_setup.hpp"
#include "link/coding/rate_matching.hpp"
#include "link/coding/rate_recovery.hpp"
#include "link/coding/turbo_encoding.hpp"
#include "quarzel/core.hpp"
#include "support/vectors.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::bitsOfHex;
using quarzel::test::Bytes;

TEST(PublishedCoding, EncoderAndRateMatchingGiveTheCodedBits) {
    const auto cases = quarzel::test::readCases("rate_matching.jsonl");
    ASSERT_EQ(cases.size(), 3);
    for (const auto& one : cases) {
        const auto K = one.at("K").get<std::uint32_t>();
        const auto E = one.at("E").get<std::size_t>();
        const Encoder encoder(K);
        Bytes streams(3 * encoder.positions());
        turboEncode(encoder, bitsOfHex(one.at("bits"), K), 0, streams);
        Bytes coded(E);
        rateMatch(RateMatching(K, 0, one.at("Ncb").get<std::size_t>()), one.at("rv").get<unsigned>(), streams,
                  coded);
        EXPECT_EQ(coded, bitsOfHex(one.at("matched"), E)) << one.at("source");
    }
}

TEST(PublishedCoding, CircularBuffersDecodeToTheHardBits) {
    const auto cases = quarzel::test::readCases("circular_buffers.jsonl");
    ASSERT_EQ(cases.size(), 2);
    for (const auto& one : cases) {
        const auto K = one.at("K").get<std::uint32_t>();
        const RateMatching matching(K);
        std::vector<std::int16_t> buffer(matching.codeBits());
        readEntries(matching, one.at("soft").get<std::vector<std::int16_t>>(), buffer);
        std::vector<std::int8_t> streams(3 * matching.positions());
        readStreams(matching, buffer, streams);
        for (const int units : {2, 4, 8}) {
            for (const int algorithm : {0, 1, 2}) {
                quarzel::Core core({.units = units, .algorithm = algorithm});
                Bytes bits(K);
                core.decode(quarzel::softBlocks<std::int8_t>(streams, matching.positions()), 8, bits);
                EXPECT_EQ(bits, bitsOfHex(one.at("hard"), K))
                    << one.at("source") << ", " << units << " units, type " << algorithm;
            }
        }
    }
}

}  // namespace
