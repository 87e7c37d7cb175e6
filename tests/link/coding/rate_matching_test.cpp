// SPDX-License-Identifier: MIT
#include "link/coding/rate_matching.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <numeric>

#include "link/coding/coding_setup.hpp"
#include "link/coding/rate_matching_cases.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::BufferCase;
using quarzel::test::Bytes;
using testing::ThrowsMessage;
namespace standard = quarzel::test::standard;

RateMatching matchingOf(const BufferCase& one) {
    return RateMatching(static_cast<std::uint32_t>(one.K), static_cast<std::size_t>(one.filler),
                        static_cast<std::size_t>(one.Ncb));
}

/// A byte of each label.
Bytes bytesOf(const std::vector<int>& labels, int shift) {
    Bytes bytes;
    for (const int label : labels) {
        bytes.push_back(static_cast<std::uint8_t>(label >> shift));
    }
    return bytes;
}

// The code bits carry their places in the streams, a byte at a time, so that a wrong choice is always seen.
TEST(RateMatching, SendsWhatTheStandardDoes) {
    std::mt19937 random = quarzel::test::seededRandom();
    quarzel::test::forBufferCases(random, 60, [](const BufferCase& one) {
        const RateMatching matching = matchingOf(one);
        const std::vector<int> sizes = one.codedSizes();
        std::vector<int> places(3 * matching.positions());
        std::iota(places.begin(), places.end(), 0);
        for (int rv = 0; rv < 4; ++rv) {
            const std::vector<int> longest = one.sent(rv, sizes.back());
            for (const int shift : {0, 8}) {
                const Bytes expected = bytesOf(longest, shift);
                const Bytes streams = bytesOf(places, shift);
                for (const int E : sizes) {
                    Bytes coded(static_cast<std::size_t>(E));
                    rateMatch(matching, static_cast<unsigned>(rv), streams, coded);
                    ASSERT_TRUE(std::equal(coded.begin(), coded.end(), expected.begin()))
                        << one.text() << ", rv " << rv << ", E " << E;
                }
            }
        }
    });
}

TEST(RateMatching, TellsWhereEachCodeBitIs) {
    std::mt19937 random = quarzel::test::seededRandom();
    quarzel::test::forBufferCases(random, 60, [](const BufferCase& one) {
        const RateMatching matching = matchingOf(one);
        std::size_t found = 0;
        for (std::size_t entry = 0; entry < matching.bufferSize(); ++entry) {
            if (one.w[entry] != standard::null) {
                ASSERT_LT(found, matching.codeBits());
                ASSERT_EQ(matching.entries()[found], entry) << one.text();
                ASSERT_EQ(matching.places()[found], one.w[entry]) << one.text();
                ++found;
            }
        }
        ASSERT_EQ(found, matching.codeBits()) << one.text();
    });
}

TEST(RateMatching, SendsFromTheSmallestBuffers) {
    for (int Ncb = 1; Ncb <= 192; ++Ncb) {
        BufferCase one(40, 0, false);
        one.Ncb = Ncb;
        if (std::all_of(one.w.begin(), one.w.begin() + Ncb, [](int label) { return label < 0; })) {
            EXPECT_THROW(matchingOf(one), std::invalid_argument);
            continue;
        }
        const RateMatching matching = matchingOf(one);
        std::vector<int> places(3 * matching.positions());
        std::iota(places.begin(), places.end(), 0);
        for (int rv = 0; rv < 4; ++rv) {
            Bytes coded(400);
            rateMatch(matching, static_cast<unsigned>(rv), bytesOf(places, 0), coded);
            EXPECT_EQ(coded, bytesOf(one.sent(rv, 400), 0)) << "N_cb " << Ncb << ", rv " << rv;
        }
    }
}

TEST(RateMatching, NamesWhatFits) {
    EXPECT_THAT([] { RateMatching(41); }, ThrowsMessage<std::invalid_argument>(
                                              "LTE has no code block of 41 bits; the nearest sizes: 40, 48"));
    EXPECT_THAT([] { RateMatching(40, 40); },
                ThrowsMessage<std::invalid_argument>("a block of 40 bits has 0 to 39 filler bits, not 40"));
    EXPECT_THAT([] { RateMatching(40, 0, 193); },
                ThrowsMessage<std::invalid_argument>("the circular buffer of a block of 40 bits, 0 of them "
                                                     "filler, has 2 to 192 entries, not 193"));
    EXPECT_THAT([] { RateMatching(40, 0, 0); },
                ThrowsMessage<std::invalid_argument>("the circular buffer of a block of 40 bits, 0 of them "
                                                     "filler, has 2 to 192 entries, not 0"));
    const RateMatching matching(40);
    const Bytes streams(132);
    Bytes coded(8);
    EXPECT_THAT([&] { rateMatch(matching, 4, streams, coded); },
                ThrowsMessage<std::invalid_argument>("the redundancy version must be 0 to 3, not 4"));
    EXPECT_THAT([&] { rateMatch(matching, 0, coded, coded); },
                ThrowsMessage<std::invalid_argument>("there must be 132 code bits, not 8"));
    EXPECT_THAT([&] { rateMatch(matching, 0, streams, std::span(coded).first(0)); },
                ThrowsMessage<std::invalid_argument>("there must be at least 1 coded bit, not 0"));
}

}  // namespace
