// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "decoder/decoder.hpp"
#include "interface/state.hpp"
#include "support/count_allocations.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

std::size_t allocationsOf(vardel_ip_quarzel_state* state, std::size_t K) {
    std::vector<unsigned char> bits(K);
    vardel_ip_quarzel_outputs outputs{bits.data(), static_cast<int>(K), 0, 0};
    const Block block(K + 4);
    const std::size_t before = allocationCount();
    EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state, &outputs, block.inputs()), 0);
    return allocationCount() - before;
}

constexpr std::size_t sizes[] = {6144, 40, 6144, 6080, 512, 1056, 1056, 2112, 40, 5056};

TEST(Allocation, NoneForABlockOfASizeThatWasSeen) {
    for (const int algorithm : {0, 1, 2}) {
        const State state = makeState(genericsOf(8, 8, algorithm));
        EXPECT_GT(allocationsOf(state.get(), 6144), 0U);
        for (const std::size_t K : sizes) {
            allocationsOf(state.get(), K);
        }
        for (const std::size_t K : sizes) {
            EXPECT_EQ(allocationsOf(state.get(), K), 0U) << K;
        }
    }
}

TEST(Allocation, LiteralDecodesTakeTheTwoVectorsOfTheCallOnceTheLargestSizeWasSeen) {
    for (const int algorithm : {0, 1, 2}) {
        const State state = makeState(genericsOf(8, 8, algorithm));
        state->decoder->disableLanes();
        EXPECT_GT(allocationsOf(state.get(), 6144), 2U);
        for (const std::size_t K : sizes) {
            EXPECT_LE(allocationsOf(state.get(), K), 2U) << K;
        }
    }
}

// Wherever memory runs out, each block is decoded or gets status 99, nothing escapes, and the state is good
// for the next batch.
TEST(Allocation, MayFailAnywhereInABatch) {
    const std::vector<std::size_t> batchSizes = {40, 1024, 40, 6144};
    std::vector<Block> blocks;
    std::vector<vardel_ip_quarzel_inputs> inputs;
    std::vector<vardel_ip_quarzel_outputs> outputs;
    std::vector<unsigned char> bits(4 * 6144);
    for (const std::size_t K : batchSizes) {
        blocks.emplace_back(K + 4, 8);
    }
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        inputs.push_back(blocks[i].inputs());
        outputs.push_back({bits.data() + 6144 * i, 6144, 0, 0});
    }
    std::size_t allowed = 0;
    int failures = 0;
    for (int result = -1; result != 0; ++allowed) {
        const State state = makeState();
        std::vector<int> statuses(blocks.size(), -77);
        const auto run = [&] {
            return vardel_ip_quarzel_bitacc_simulate_batch(state.get(), outputs.data(), inputs.data(),
                                                           static_cast<int>(inputs.size()), statuses.data());
        };
        failAllocationsAfter(allowed);
        result = run();
        allowAllocations();
        for (const int status : statuses) {
            ASSERT_TRUE(status == 0 || status == 99) << status << " after " << allowed << " allocations";
        }
        failures += result != 0 ? 1 : 0;
        ASSERT_EQ(run(), 0) << "after " << allowed << " allocations";
        ASSERT_LT(allowed, 1000U);
    }
    EXPECT_GT(failures, 10);
}

}  // namespace
}  // namespace quarzel::test
