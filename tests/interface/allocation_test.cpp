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

}  // namespace
}  // namespace quarzel::test
