// SPDX-License-Identifier: MIT
#include "decoder/segments.hpp"

#include <gtest/gtest.h>

#include <sstream>

#include "interleaver/lte_params.hpp"

namespace quarzel::test {
namespace {

std::vector<std::uint32_t> windowLengths(std::uint32_t length) {
    std::vector<std::uint32_t> windows;
    for (std::uint32_t offset = 0; offset < length; offset += windows.back()) {
        windows.push_back(windowLength(length - offset));
    }
    return windows;
}

struct Segments {
    std::vector<ABSegment> alpha;
    std::vector<ABSegment> beta;
};

Segments cut(std::uint32_t K, std::uint32_t count) {
    Segments segments;
    cutSegments(K, count, segments.alpha, segments.beta);
    return segments;
}

TEST(Segments, ThreadsDoubleWhileEachSegmentKeeps64Steps) {
    EXPECT_EQ(threadSegments(6144, 16), 16U);
    EXPECT_EQ(threadSegments(40, 32), 1U);
    EXPECT_EQ(threadSegments(127, 32), 1U);
    EXPECT_EQ(threadSegments(128, 32), 2U);
    EXPECT_EQ(threadSegments(1008, 16), 8U);
    EXPECT_EQ(threadSegments(1024, 16), 16U);
    EXPECT_EQ(threadSegments(2112, 16), 16U);
    EXPECT_EQ(threadSegments(1004, 16), 8U);
    EXPECT_EQ(threadSegments(6144, 1), 1U);
    EXPECT_EQ(threadSegments(0, 32), 1U);
}

TEST(Segments, DoublingMayPassAThreadCountThatIsNoPowerOf2) {
    EXPECT_EQ(threadSegments(6144, 12), 16U);
    EXPECT_EQ(threadSegments(6144, 3), 4U);
}

TEST(Segments, AnAbsurdThreadCountEndsWithTheBlock) {
    EXPECT_EQ(threadSegments(0xFFFFFFFFU, 0xFFFFFFFFU), 1U << 25);
    EXPECT_EQ(threadSegments(0xFFFFFFFFU, 0), 1U);
}

TEST(Segments, WindowsAre64StepsAndTheRestNearlyEqual) {
    using Lengths = std::vector<std::uint32_t>;
    EXPECT_EQ(windowLengths(384), Lengths(6, 64));
    EXPECT_EQ(windowLengths(40), Lengths{40});
    EXPECT_EQ(windowLengths(64), Lengths{64});
    EXPECT_EQ(windowLengths(65), (Lengths{33, 32}));
    EXPECT_EQ(windowLengths(126), (Lengths{63, 63}));
    EXPECT_EQ(windowLengths(127), (Lengths{64, 63}));
    EXPECT_EQ(windowLengths(128), (Lengths{64, 64}));
    EXPECT_EQ(windowLengths(132), (Lengths{64, 34, 34}));
    EXPECT_EQ(windowLengths(0), Lengths{});
}

TEST(Segments, TextShowsAHalfOpenRange) {
    std::ostringstream stream;
    stream << cut(6144, 16).alpha.front();
    EXPECT_EQ(stream.str(), "[0,384)");
}

TEST(Segments, WindowsAreWindowMajorAndEndJustBelow) {
    const Segments segments = cut(256, 2);
    const std::vector<std::pair<unsigned, unsigned>> expected = {{63, 0}, {191, 127}, {127, 63}, {255, 191}};
    ASSERT_EQ(segments.beta.size(), expected.size());
    for (std::size_t j = 0; j < expected.size(); ++j) {
        EXPECT_EQ(segments.beta[j].from, expected[j].first);
        EXPECT_EQ(segments.beta[j].to, expected[j].second);
    }
}

TEST(Segments, EverySizeIsCoveredOnceByWindowsOfAtMost64Steps) {
    for (const LteParams& params : lteParams) {
        for (const std::uint32_t units : {2U, 4U, 8U}) {
            const std::uint32_t count = threadSegments(params.K, 4 * units);
            ASSERT_EQ(params.K % count, 0U);
            const Segments segments = cut(params.K, count);
            ASSERT_EQ(segments.alpha.size(), count);
            EXPECT_EQ(segments.alpha.front().from, 0U);
            EXPECT_EQ(segments.alpha.back().to, params.K);
            for (std::uint32_t i = 1; i < count; ++i) {
                EXPECT_EQ(segments.alpha[i].from, segments.alpha[i - 1].to);
            }
            ASSERT_EQ(segments.beta.size() % count, 0U);
            std::vector<int> covered(params.K, 0);
            for (const ABSegment& window : segments.beta) {
                const std::uint32_t bottom = window.to == 0 ? 0 : window.to + 1;
                EXPECT_LE(window.from - bottom, 63U);
                for (std::uint32_t step = bottom; step <= window.from; ++step) {
                    ++covered[step];
                }
            }
            EXPECT_EQ(covered, std::vector<int>(params.K, 1)) << params.K << " " << units;
        }
    }
}

}  // namespace
}  // namespace quarzel::test
