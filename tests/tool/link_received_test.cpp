// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>

#include "link/chain/link_run.hpp"
#include "link/coding/standard_coding.hpp"
#include "link_set.hpp"

namespace quarzel::test {

namespace {

/// Which value of the three streams each entry of the circular buffer is.
std::vector<int> placesInBuffer(int K, int F) {
    standard::Streams places;
    for (int stream = 0; stream < 3; ++stream) {
        for (int k = 0; k < K + 4; ++k) {
            places[static_cast<std::size_t>(stream)].push_back(stream < 2 && k < F ? standard::null
                                                                                   : stream * (K + 4) + k);
        }
    }
    return standard::circularBuffer(places);
}

class LinkReceived : public LinkSet {};

}  // namespace

TEST_P(LinkReceived, IsCombinedForTheCore) {
    const link::CodedLink link(setup());
    Words received = words("link/received.hex");
    Words buffer = words("link/soft_buffer.hex");
    std::vector<Words> inputs = this->inputs();
    std::size_t strongest = 0;
    for (std::size_t block = 0; block < blocks; ++block) {
        std::vector<std::vector<int>> sums(link.segmentation().C);
        for (const unsigned rv : setup().redundancyVersions) {
            for (std::size_t r = 0; r < sums.size(); ++r) {
                const int K = static_cast<int>(link.segmentation().size(r));
                const int F = r == 0 ? static_cast<int>(link.segmentation().F) : 0;
                const std::vector<int> w = placesInBuffer(K, F);
                sums[r].resize(w.size());
                const std::size_t E = link.codeBlock(r).codedBits();
                const std::vector<int> soft = received.soft(E);
                const std::vector<int> sent = standard::selection(w, K + 4, static_cast<int>(w.size()),
                                                                  static_cast<int>(rv), static_cast<int>(E));
                for (std::size_t i = 0; i < E; ++i) {
                    int& sum = sums[r][static_cast<std::size_t>(sent[i])];
                    sum = std::clamp(sum + soft[i], -128, 127);
                    strongest += sum == -128 || sum == 127 ? 1U : 0U;
                }
                ASSERT_EQ(buffer.soft(w.size()), sums[r]);
                std::vector<int> streams(3 * static_cast<std::size_t>(K + 4));
                std::fill_n(streams.begin(), F, -128);
                std::fill_n(streams.begin() + K + 4, F, -128);
                for (std::size_t k = 0; k < w.size(); ++k) {
                    if (w[k] != standard::null) {
                        streams[static_cast<std::size_t>(w[k])] = sums[r][k];
                    }
                }
                ASSERT_EQ(nextInput(inputs, link.segmentation().size(r)), streams);
            }
        }
    }
    EXPECT_TRUE(received.isAtEnd() && buffer.isAtEnd() && inputs[0].isAtEnd());
    // Code blocks alone are received strongly.
    EXPECT_TRUE(hasCrc() || strongest > 0) << "no sum is clipped";
}

TEST_P(LinkReceived, IsWhatASweepReceives) {
    const link::CodedLink link(setup());
    const link::Decibels ebN0 = {1'000'000};
    const auto channel = link::makeChannel(setup().channel, ebN0, link.rate());
    link::LinkRun run(link, seed);
    run.begin(ebN0, std::vector<std::uint64_t>{0}, blocks);
    std::vector<Words> inputs = this->inputs();
    // The core is given block after block, the run sends transmission after transmission.
    const std::size_t C = link.segmentation().C;
    std::vector<std::vector<int>> sent;
    for (std::size_t i = 0; i < blocks * transmissions() * C; ++i) {
        sent.push_back(nextInput(inputs, link.segmentation().size(i % C)));
    }
    for (std::uint32_t t = 0; t < transmissions(); ++t) {
        run.transmit(*channel, t);
        for (std::size_t i = 0; i < blocks; ++i) {
            for (std::size_t r = 0; r < C; ++r) {
                const auto soft = run.soft(i, r);
                ASSERT_EQ(sent[(i * transmissions() + t) * C + r],
                          std::vector<int>(soft.begin(), soft.end()));
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(AllKinds, LinkReceived, testing::ValuesIn(linkCases()),
                         [](const auto& test) { return std::string(test.param.name); });

}  // namespace quarzel::test
