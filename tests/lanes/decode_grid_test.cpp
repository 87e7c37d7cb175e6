// SPDX-License-Identifier: MIT
// Every candidate gives the literal decoder's decisions: every block size, unit count, algorithm type and
// kernel.
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "interleaver/lte_block_sizes.hpp"
#include "lanes/lane_setup.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

struct LaneModel {
    std::string name;
    std::unique_ptr<lanes::Candidate> candidate;  ///< the model's decoder refers to it
    State state;
};

/// A model for each kernel of each supported candidate: one that has that kernel and the narrower ones.
std::vector<LaneModel> makeLaneModels(int units, int algorithm) {
    std::vector<LaneModel> models;
    for (const lanes::Candidate& all : supportedCandidates()) {
        for (std::size_t count = 1; count <= all.kernelCount; ++count) {
            auto some = std::make_unique<lanes::Candidate>(all);
            some->kernelCount = count;
            State state = makeLaneState(units, 8, algorithm, *some);
            models.push_back(
                {all.name + std::string(", up to ") + std::to_string(all.kernels[count - 1].width) + " lanes",
                 std::move(some), std::move(state)});
        }
    }
    return models;
}

/// A few different blocks of one size, and what the literal decoder makes of them.
struct Expected {
    std::vector<Block> blocks;
    std::vector<std::vector<unsigned char>> bits;
};

Expected decodeLiterally(const State& literal, std::mt19937& random, std::size_t K, int iterations) {
    Expected expected;
    const int first = randomFrom(random, 0, inputKinds - 1);
    const int count = exhaustive() ? inputKinds : 3;
    for (int i = 0; i < count; ++i) {
        Block block = randomBlock(random, static_cast<Input>((first + 2 * i + i / 3) % inputKinds), K);
        block.iterations = iterations;
        Result result = simulate(literal.get(), block.inputs());
        EXPECT_EQ(result.status, 0);
        result.bits.resize(K);
        expected.blocks.push_back(std::move(block));
        expected.bits.push_back(std::move(result.bits));
    }
    return expected;
}

/// Decode a group of blocks, which repeat the expected ones in a random order.
void expectLanesEqual(const LaneModel& model, const Expected& expected, std::size_t groupSize,
                      std::mt19937& random) {
    const std::size_t K = expected.bits.front().size();
    std::vector<std::size_t> order(groupSize);
    std::vector<std::vector<unsigned char>> bits(groupSize, std::vector<unsigned char>(K, 0xEE));
    std::vector<vardel_ip_quarzel_inputs> inputs;
    std::vector<vardel_ip_quarzel_outputs> outputs;
    for (std::size_t i = 0; i < groupSize; ++i) {
        order[i] = random() % expected.blocks.size();
        inputs.push_back(expected.blocks[order[i]].inputs());
        outputs.push_back({bits[i].data(), static_cast<int>(K), 0, 0});
    }
    ASSERT_TRUE(takesLanes(*model.state, static_cast<std::uint32_t>(K)));
    ASSERT_EQ(vardel_ip_quarzel_bitacc_simulate_batch(model.state.get(), outputs.data(), inputs.data(),
                                                      static_cast<int>(groupSize), nullptr),
              0);
    for (std::size_t i = 0; i < groupSize; ++i) {
        ASSERT_EQ(bits[i], expected.bits[order[i]])
            << model.name << ", K " << K << ", iterations " << expected.blocks[0].iterations << ", block "
            << i << " of " << groupSize;
    }
}

/// One of the widest vectors holds at most 32 blocks of the smallest sizes and 4 of the largest.
std::size_t moreThanAVector(std::size_t K) {
    return K < 128 ? 40 : K < 512 ? 20 : 9;
}

#if defined(NDEBUG)
constexpr std::size_t stride = 1;
#else
constexpr std::size_t stride = 10;  // the literal decoder is slow without an optimiser
#endif

class DecodeGrid : public testing::TestWithParam<std::tuple<int, int>> {};

TEST_P(DecodeGrid, EveryCandidateGivesTheLiteralDecisionsForEveryBlockSize) {
    const auto [units, algorithm] = GetParam();
    std::mt19937 random = seededRandom();
    const State literal = makeLiteralState(units, 8, algorithm);
    const std::vector<LaneModel> models = makeLaneModels(units, algorithm);
    ASSERT_FALSE(models.empty());
    const std::vector<std::uint32_t> sizes = lteBlockSizes();
    const int rounds = exhaustive() ? 15 : 1;
    const std::size_t step = exhaustive() ? 1 : stride;
    for (int round = 0; round < rounds; ++round) {
        for (std::size_t i = random() % step; i < sizes.size(); i += step) {
            const std::size_t K = sizes[i];
            // Few iterations are the rule, so that the default run is short.
            const int iterations = exhaustive()                    ? round + 1
                                   : randomFrom(random, 0, 7) == 0 ? randomFrom(random, 1, 15)
                                                                   : randomFrom(random, 1, 3);
            const Expected expected = decodeLiterally(literal, random, K, iterations);
            const int most = static_cast<int>(moreThanAVector(K));
            for (const LaneModel& model : models) {
                for (const int groupSize : {1, randomFrom(random, 2, most), most}) {
                    ASSERT_NO_FATAL_FAILURE(
                        expectLanesEqual(model, expected, static_cast<std::size_t>(groupSize), random));
                }
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(UnitsAndTypes, DecodeGrid,
                         testing::Combine(testing::Values(2, 4, 8), testing::Values(0, 1, 2)),
                         [](const auto& grid) {
                             return std::to_string(std::get<0>(grid.param)) + "UnitsType" +
                                    std::to_string(std::get<1>(grid.param));
                         });

}  // namespace
}  // namespace quarzel::test
