// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "decoder/segments.hpp"
#include "decoder/trace_columns.hpp"
#include "engine/dump_columns.hpp"
#include "engine/trellis.hpp"
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

TEST(CodePort, GivesTheBranchesOfTheTrellisWithTheColumnsOfTheirMetrics) {
    for (unsigned state = 0; state < encoderStates; ++state) {
        const Branch one = branch(state, 1);
        const Branch zero = branch(state, 0);
        EXPECT_EQ(one.from, state);
        EXPECT_EQ(one.to, trellis::links.plusTarget[state]);
        EXPECT_EQ(zero.to, trellis::links.minusTarget[state]);
        EXPECT_EQ(one.metric, zero.metric);
        EXPECT_EQ(branchColumns[one.metric - 4], trellis::links.branchMetric[state]);
    }
    EXPECT_THROW(branch(8, 0), std::invalid_argument);
    EXPECT_THROW(branch(0, 2), std::invalid_argument);
}

TEST(CodePort, GivesTheCorrectionsOfMaxStar) {
    const auto table = corrections();
    EXPECT_EQ(table[2048], 6) << "ln 2 in units of 1/8";
    EXPECT_EQ(table[2047], table[2048]) << "-1 shares the entry of 0";
    EXPECT_EQ(table[0], 0);
    EXPECT_EQ(table[4095], 0);
    for (std::size_t d = 0; d < 2048; ++d) {
        EXPECT_EQ(table[2048 + d], table[2047 - d]);
        const double point = static_cast<double>(d / 4) / 2;  // the low 2 bits of a difference do not count
        EXPECT_NEAR(table[2048 + d], 8 * std::log1p(std::exp(-point)), 0.5) << d;
    }
}

TEST(CodePort, NamesTheSignalsInTheOrderOfTheTraceColumns) {
    std::size_t column = 0;
    std::vector<std::string> descriptions;
    for (const Signal& signal : signals()) {
        for (unsigned value = 0; value < signal.width; ++value, ++column) {
            ASSERT_LT(column, traceColumns.size());
            EXPECT_STREQ(signal.name, traceColumns[column].signal);
            EXPECT_EQ(signal.width > 1 ? static_cast<int>(signal.first + value) : -1,
                      traceColumns[column].index);
        }
        descriptions.emplace_back(signal.description);
    }
    EXPECT_EQ(column, traceColumnCount);
    EXPECT_THAT(descriptions,
                testing::ElementsAre("intrinsic value", "forward metric", "backward metric", "branch metric",
                                     "log-likelihood ratio", "extrinsic value"));
    Signal none;
    EXPECT_EQ(vardel_ip_quarzel_get_signal(-1, &none), 1);
}

TEST(CodePort, TheLibraryHasTheVersionOfItsHeader) {
    EXPECT_STREQ(vardel_ip_quarzel_version(), VARDEL_IP_QUARZEL_VERSION);
    EXPECT_EQ(std::string(vardel_ip_quarzel_version()), QUARZEL_PROJECT_VERSION);
}

}  // namespace
}  // namespace quarzel::test
