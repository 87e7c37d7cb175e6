// SPDX-License-Identifier: MIT
// A block of one segment that is decoded alone, with its states in lanes, gives the literal decisions.
#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <vector>

#include "decoder/segments.hpp"
#include "interleaver/lte_block_sizes.hpp"
#include "lanes/lane_setup.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

/// The block sizes that a core of some units does not cut.
std::vector<std::uint32_t> uncutSizes(int units) {
    std::vector<std::uint32_t> sizes = lteBlockSizes();
    std::erase_if(sizes, [units](std::uint32_t K) {
        return threadSegments(K, 4 * static_cast<std::uint32_t>(units)) != 1;
    });
    return sizes;
}

/// The decisions after every iteration of one block, iteration by iteration.
template <class Value>
std::vector<unsigned char> decode(const State& state, const std::vector<Value> (&streams)[3],
                                  int iterations) {
    const std::size_t K = streams[0].size() - 4;
    std::vector<unsigned char> bits(static_cast<std::size_t>(iterations) * K + 8, 0xEE);
    const vardel_ip_quarzel_array_inputs inputs{streams[0].data(),
                                                streams[1].data(),
                                                streams[2].data(),
                                                0,
                                                1,
                                                static_cast<int>(sizeof(Value)),
                                                static_cast<int>(K + 4),
                                                1,
                                                iterations,
                                                nullptr};
    const vardel_ip_quarzel_array_outputs outputs{bits.data(), 0, static_cast<std::ptrdiff_t>(K), nullptr};
    EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_array(state.get(), &outputs, &inputs, nullptr), 0);
    return bits;
}

class BlockAlone : public testing::TestWithParam<std::tuple<int, int>> {};

TEST_P(BlockAlone, GivesTheLiteralDecisionsAfterEveryIterationForEveryUncutSize) {
    const auto [units, algorithm] = GetParam();
    std::mt19937 random = seededRandom();
    const State literal = makeLiteralState(units, 8, algorithm);
    std::vector<State> states;
    for (const lanes::Candidate& candidate : supportedCandidates()) {
        states.push_back(makeLaneState(units, 8, algorithm, candidate));
    }
    const std::vector<std::uint32_t> sizes = uncutSizes(units);
    ASSERT_EQ(sizes.size(), 11U);  // 40 to 120
    for (int round = 0; round < (exhaustive() ? 200 : 4); ++round) {
        for (const std::uint32_t K : sizes) {
            for (int kind = 0; kind < inputKinds; ++kind) {
                const Block block = randomBlock(random, static_cast<Input>(kind), K);
                const std::vector<std::int32_t> ints[3] = {block.systematic, block.parity1, block.parity2};
                std::vector<std::int16_t> words[3];
                std::vector<std::int8_t> bytes[3];
                for (std::size_t stream = 0; stream < 3; ++stream) {
                    words[stream].assign(ints[stream].begin(), ints[stream].end());
                    bytes[stream].assign(ints[stream].begin(), ints[stream].end());
                }
                const int iterations = randomFrom(random, 1, 15);
                const auto expected = decode(literal, ints, iterations);
                for (const State& state : states) {
                    SCOPED_TRACE(std::string(vardel_ip_quarzel_get_implementation(state.get())) + ", K " +
                                 std::to_string(K) + ", input " + std::to_string(kind));
                    ASSERT_EQ(decode(state, ints, iterations), expected);
                    ASSERT_EQ(decode(state, words, iterations), expected);
                    ASSERT_EQ(decode(state, bytes, iterations), expected);
                }
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(UnitsAndTypes, BlockAlone,
                         testing::Combine(testing::Values(2, 4, 8), testing::Values(0, 1)),
                         [](const auto& grid) {
                             return std::to_string(std::get<0>(grid.param)) + "UnitsType" +
                                    std::to_string(std::get<1>(grid.param));
                         });

TEST(LaneCandidates, AllThatShuffleBytesHaveAKernelForABlockAlone) {
    for (const lanes::Candidate& candidate : lanes::candidates()) {
        const bool shuffles = candidate.name != std::string("baseline");
        for (std::size_t algorithm = 0; algorithm < 3; ++algorithm) {
            EXPECT_EQ(candidate.kernels[0].alone[algorithm] != nullptr, shuffles && algorithm < 2)
                << candidate.name << ", type " << algorithm;
        }
    }
}

}  // namespace
}  // namespace quarzel::test
