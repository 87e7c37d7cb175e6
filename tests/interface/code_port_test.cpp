// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "decoder/segments.hpp"
#include "decoder/trace_columns.hpp"
#include "interleaver/closed_form.hpp"
#include "interleaver/lte_params.hpp"
#include "quarzel/code.hpp"

namespace quarzel::test {
namespace {

TEST(CodePort, GivesTheBlockSizesWithTheirParameters) {
    const std::vector<BlockSize> sizes = blockSizes();
    ASSERT_EQ(sizes.size(), 188U);
    for (std::size_t i = 0; i < sizes.size(); ++i) {
        EXPECT_EQ(sizes[i].K, lteParams[i].K);
        EXPECT_EQ(sizes[i].f1, lteParams[i].f1);
        EXPECT_EQ(sizes[i].f2, lteParams[i].f2);
    }
    EXPECT_EQ(findBlockSize(6144)->f2, 480U);
    EXPECT_FALSE(findBlockSize(41));
    BlockSize untouched{1, 2, 3};
    EXPECT_EQ(vardel_ip_quarzel_get_block_size(-1, &untouched), 1);
    EXPECT_EQ(vardel_ip_quarzel_get_block_size(188, &untouched), 1);
    EXPECT_EQ(untouched.K, 1U);
}

TEST(CodePort, GivesThePermutationOfEverySize) {
    for (const BlockSize& size : blockSizes()) {
        const std::vector<unsigned> table = permutation(size.K);
        ASSERT_EQ(table.size(), size.K);
        for (std::uint64_t i = 0; i < size.K; ++i) {
            ASSERT_EQ(table[i], (size.f1 * i + size.f2 * i * i) % size.K) << size.K;
        }
    }
    EXPECT_THROW(permutation(41), std::invalid_argument);
    EXPECT_THROW(permutation(0), std::invalid_argument);
}

TEST(CodePort, GivesSegmentsAndWindowsAsTheDecoderCutsThem) {
    for (const BlockSize& size : blockSizes()) {
        for (const unsigned units : {2U, 4U, 8U}) {
            const Layout cut = layout(size.K, units);
            EXPECT_EQ(cut.threads, 4 * units);
            std::vector<ABSegment> alpha;
            std::vector<ABSegment> beta;
            cutSegments(size.K, threadSegments(size.K, cut.threads), alpha, beta);
            ASSERT_EQ(cut.segments, alpha.size());
            EXPECT_EQ(cut.segment_steps, alpha[0].to);
            ASSERT_EQ(cut.windows * cut.segments, beta.size());
            unsigned steps = 0;
            for (unsigned window = 0; window < cut.windows; ++window) {
                steps += cut.window_steps[window];
                EXPECT_EQ(beta[window * cut.segments].from + 1, steps);
            }
            EXPECT_EQ(steps, cut.segment_steps);
        }
    }
    EXPECT_THROW(layout(6144, 3), std::invalid_argument);
    EXPECT_THROW(layout(6143, 4), std::invalid_argument);
}

TEST(CodePort, NamesTheSignalsInTheOrderOfTheTraceColumns) {
    std::size_t column = 0;
    for (const Signal& signal : signals()) {
        for (unsigned value = 0; value < signal.width; ++value, ++column) {
            ASSERT_LT(column, traceColumns.size());
            EXPECT_STREQ(signal.name, traceColumns[column].signal);
            EXPECT_EQ(signal.width > 1 ? static_cast<int>(signal.first + value) : -1,
                      traceColumns[column].index);
        }
        EXPECT_STRNE(signal.description, "");
    }
    EXPECT_EQ(column, traceColumnCount);
}

TEST(CodePort, TheLibraryHasTheVersionOfItsHeader) {
    EXPECT_STREQ(vardel_ip_quarzel_version(), VARDEL_IP_QUARZEL_VERSION);
    EXPECT_EQ(std::string(vardel_ip_quarzel_version()), QUARZEL_PROJECT_VERSION);
}

}  // namespace
}  // namespace quarzel::test
