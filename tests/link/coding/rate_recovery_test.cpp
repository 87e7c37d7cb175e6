// SPDX-License-Identifier: MIT
#include "link/coding/rate_recovery.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "link/coding/coding_setup.hpp"
#include "link/coding/rate_matching_cases.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::BufferCase;
using testing::ThrowsMessage;
namespace standard = quarzel::test::standard;

using Soft = std::vector<std::int16_t>;

RateMatching matchingOf(const BufferCase& one) {
    return RateMatching(static_cast<std::uint32_t>(one.K), static_cast<std::size_t>(one.filler),
                        static_cast<std::size_t>(one.Ncb));
}

/// The sums of all code bits, added up one by one at their places in the streams.
class Receiver {
  public:
    Receiver(const BufferCase& one, unsigned width)
        : itsCase(one), itsSums(static_cast<std::size_t>(3 * (one.K + 4))), itsLimit(1 << (width - 1)) {}

    /// Add what has come since the first `from` soft values.
    template <class Value>
    void add(const std::vector<int>& sent, const std::vector<Value>& soft, std::size_t from = 0) {
        for (std::size_t i = from; i < soft.size(); ++i) {
            int& sum = itsSums[static_cast<std::size_t>(sent[i])];
            sum += soft[i];
            sum = sum > itsLimit - 1 ? itsLimit - 1 : sum < -itsLimit ? -itsLimit : sum;
        }
    }

    std::vector<int> streams() const {
        std::vector<int> result = itsSums;
        for (int& sum : result) {
            sum = sum > 127 ? 127 : sum < -128 ? -128 : sum;
        }
        for (int i = 0; i < itsCase.filler; ++i) {
            result[static_cast<std::size_t>(i)] = -128;
            result[static_cast<std::size_t>(itsCase.K + 4 + i)] = -128;
        }
        return result;
    }

    std::vector<int> entries() const {
        std::vector<int> result;
        for (int entry = 0; entry < itsCase.Ncb; ++entry) {
            const int label = itsCase.w[static_cast<std::size_t>(entry)];
            result.push_back(label == standard::null ? 0 : itsSums[static_cast<std::size_t>(label)]);
        }
        return result;
    }

  private:
    const BufferCase& itsCase;
    std::vector<int> itsSums;
    int itsLimit;
};

std::vector<int> streamsOf(const RateMatching& matching, const Soft& buffer) {
    std::vector<std::int8_t> streams(3 * matching.positions(), 99);
    readStreams(matching, buffer, streams);
    return {streams.begin(), streams.end()};
}

std::vector<int> entriesOf(const RateMatching& matching, const Soft& buffer) {
    Soft entries(matching.bufferSize(), 99);
    writeEntries(matching, buffer, entries);
    return {entries.begin(), entries.end()};
}

template <class Value>
std::vector<Value> randomSoft(std::mt19937& random, int size) {
    std::vector<Value> soft;
    for (int i = 0; i < size; ++i) {
        soft.push_back(static_cast<Value>(quarzel::test::randomWord(random)));
    }
    return soft;
}

TEST(RateRecovery, PutsTogetherWhatTheStandardSends) {
    std::mt19937 random = quarzel::test::seededRandom();
    quarzel::test::forBufferCases(random, 30, [&random](const BufferCase& one) {
        const RateMatching matching = matchingOf(one);
        const std::vector<int> sizes = one.codedSizes();
        const auto all = randomSoft<std::int8_t>(random, sizes.back());
        for (int rv = 0; rv < 4; ++rv) {
            const std::vector<int> longest = one.sent(rv, sizes.back());
            Receiver receiver(one, 8);
            std::size_t added = 0;
            for (const int E : sizes) {
                const std::vector<std::int8_t> soft(all.begin(), all.begin() + E);
                Soft buffer(matching.codeBits());
                rateRecover(matching, static_cast<unsigned>(rv), soft, buffer);
                receiver.add(longest, soft, added);
                added = soft.size();
                ASSERT_EQ(streamsOf(matching, buffer), receiver.streams())
                    << one.text() << ", rv " << rv << ", E " << E;
            }
        }
    });
}

TEST(RateRecovery, CombinesTransmissionsAtEveryWidth) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (unsigned width = 2; width <= 16; ++width) {
        quarzel::test::forBufferCases(random, 4, [&](const BufferCase& one) {
            if (one.K > 1000 && quarzel::test::isExhaustive()) {
                return;
            }
            const RateMatching matching = matchingOf(one);
            Soft buffer(matching.codeBits());
            Receiver receiver(one, width);
            for (int transmission = 0; transmission < 4; ++transmission) {
                const int rv = quarzel::test::randomBelow(random, 4);
                const auto soft = randomSoft<std::int16_t>(random, one.Ncb / 2 + transmission);
                rateRecover(matching, static_cast<unsigned>(rv), soft, buffer, width);
                receiver.add(one.sent(rv, static_cast<int>(soft.size())), soft);
                ASSERT_EQ(entriesOf(matching, buffer), receiver.entries())
                    << one.text() << ", width " << width;
                ASSERT_EQ(streamsOf(matching, buffer), receiver.streams())
                    << one.text() << ", width " << width;
            }
            Soft entries(matching.bufferSize());
            writeEntries(matching, buffer, entries);
            Soft back(buffer.size());
            readEntries(matching, entries, back);
            ASSERT_EQ(back, buffer);
        });
    }
}

TEST(RateRecovery, NamesWhatFits) {
    const RateMatching matching(40);
    Soft buffer(132);
    Soft soft(10);
    Soft entries(192);
    std::vector<std::int8_t> streams(132);
    const auto expect = [](auto call, const char* message) {
        EXPECT_THAT(call, ThrowsMessage<std::invalid_argument>(message));
    };
    expect([&] { rateRecover(matching, 0, Soft(), buffer); }, "there must be at least 1 coded bit, not 0");
    expect([&] { rateRecover(matching, 4, soft, buffer); }, "the redundancy version must be 0 to 3, not 4");
    expect([&] { rateRecover(matching, 0, soft, soft); },
           "there must be 132 values in the soft buffer, not 10");
    expect([&] { rateRecover(matching, 0, soft, buffer, 1); },
           "a soft buffer's values have 2 to 16 bits, not 1");
    expect([&] { rateRecover(matching, 0, soft, buffer, 17); },
           "a soft buffer's values have 2 to 16 bits, not 17");
    expect([&] { readStreams(matching, buffer, std::span(streams).first(131)); },
           "there must be 132 values in the three streams, not 131");
    expect([&] { readStreams(matching, soft, streams); },
           "there must be 132 values in the soft buffer, not 10");
    expect([&] { readEntries(matching, soft, buffer); },
           "there must be 192 entries in the circular buffer, not 10");
    expect([&] { writeEntries(matching, soft, entries); },
           "there must be 132 values in the soft buffer, not 10");
    EXPECT_THAT(buffer, testing::Each(0));
}

}  // namespace
