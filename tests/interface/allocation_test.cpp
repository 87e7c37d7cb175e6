// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "support/count_allocations.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

TEST(Allocation, NothingButTheTwoVectorsOfTheCallOnceTheLargestSizeWasSeen) {
    for (const int algorithm : {0, 1, 2}) {
        const State state = makeState(genericsOf(8, 8, algorithm));
        std::vector<unsigned char> bits(6144);
        vardel_ip_quarzel_outputs outputs{bits.data(), 6144, 0, 0};
        const auto allocationsOf = [&](std::size_t K) {
            const Block block(K + 4);
            const std::size_t before = allocationCount();
            EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, block.inputs()), 0);
            return allocationCount() - before;
        };
        EXPECT_GT(allocationsOf(6144), 2U);
        for (const std::size_t K : {40U, 6144U, 6080U, 512U, 1056U, 1056U, 2112U, 40U, 5056U}) {
            EXPECT_LE(allocationsOf(K), 2U) << K;
        }
    }
}

}  // namespace
}  // namespace quarzel::test
