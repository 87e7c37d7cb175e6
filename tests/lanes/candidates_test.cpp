// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <numeric>
#include <set>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "interleaver/interleaver_3gpplte.hpp"
#include "lanes/lane_decode.hpp"
#include "lanes/lane_setup.hpp"

namespace quarzel::test {
namespace {

TEST(LaneCandidates, TheBestIsTheFirstThatTheMachineSupports) {
    const auto supported = supportedCandidates();
    ASSERT_FALSE(supported.empty());
    EXPECT_STREQ(lanes::bestCandidate().name, supported.front().get().name);
    // Runs on a machine whose best is known, an emulated one, say so.
    if (const char* expected = std::getenv("QUARZEL_TEST_BEST_CANDIDATE")) {
        EXPECT_STREQ(lanes::bestCandidate().name, expected);
    }
}

#if defined(__x86_64__) && defined(__linux__)
TEST(LaneCandidates, AreSupportedWhereTheKernelTellsOfTheirInstructions) {
    if (std::getenv("QUARZEL_TEST_BEST_CANDIDATE") != nullptr) {
        GTEST_SKIP() << "an emulated processor is not the one that the kernel tells of";
    }
    std::ifstream file("/proc/cpuinfo");
    std::string line;
    while (std::getline(file, line) && !line.starts_with("flags")) {
    }
    std::istringstream words(line);
    const std::set<std::string> flags{std::istream_iterator<std::string>(words), {}};
    const std::vector<std::vector<std::string>> needed = {
        {"avx512bw", "avx512vl", "avx512dq"}, {"avx2"}, {"sse4_1"}, {}};
    ASSERT_EQ(lanes::candidates().end() - lanes::candidates().begin(), 4);
    for (std::size_t i = 0; i < needed.size(); ++i) {
        EXPECT_EQ(lanes::candidates().begin()[i].supported(),
                  std::ranges::all_of(needed[i], [&](const auto& flag) { return flags.contains(flag); }))
            << lanes::candidates().begin()[i].name;
    }
}
#endif

TEST(LaneCandidates, TheLastRunsEverywhere) {
    const lanes::Candidate& last = lanes::candidates().end()[-1];
#if defined(__aarch64__)
    EXPECT_STREQ(last.name, "neon");
#else
    EXPECT_STREQ(last.name, "baseline");
#endif
    EXPECT_TRUE(last.supported());
}

TEST(LaneCandidates, KernelsComeByAscendingWidthFromEightLanesUp) {
    for (const lanes::Candidate& candidate : lanes::candidates()) {
        ASSERT_GE(candidate.kernelCount, 1U) << candidate.name;
        for (std::size_t i = 0; i < candidate.kernelCount; ++i) {
            EXPECT_EQ(candidate.kernels[i].width, std::size_t{8} << i) << candidate.name;
        }
    }
}

TEST(LaneLayouts, WhatLanesCannotFollowIsRefused) {
    LaneDecoder decoder(1, lanes::bestCandidate());
    LaneSchedule schedule;
    TInterleaver3GPPLTE().calcInterleaver(schedule.permutation, 512);
    schedule.segments = 8;
    schedule.windowLength = {64};
    EXPECT_TRUE(decoder.add(schedule));
    // Two positions of different slices in each other's place, and then two of different rows.
    schedule.segments = 16;
    std::swap(schedule.permutation[0], schedule.permutation[32]);
    EXPECT_FALSE(decoder.add(schedule));
    std::swap(schedule.permutation[0], schedule.permutation[32]);
    std::swap(schedule.permutation[1], schedule.permutation[2]);
    EXPECT_FALSE(decoder.add(schedule));
    schedule.permutation.resize(511);
    EXPECT_FALSE(decoder.add(schedule));
}

TEST(LaneLayouts, SegmentsAreAtMost64AndWithTheirTailAtMost1024Steps) {
    const auto isTaken = [](std::uint32_t K, std::uint32_t segments) {
        LaneSchedule schedule;
        schedule.permutation.resize(K);
        std::iota(schedule.permutation.begin(), schedule.permutation.end(), 0U);
        schedule.segments = segments;
        schedule.windowLength = {static_cast<std::uint16_t>(K / segments)};
        return LaneDecoder(1, lanes::bestCandidate()).add(schedule);
    };
    EXPECT_TRUE(isTaken(6144, 64));
    EXPECT_FALSE(isTaken(6144, 128));
    EXPECT_TRUE(isTaken(1020, 1));
    EXPECT_FALSE(isTaken(1021, 1));
    EXPECT_FALSE(isTaken(6144, 4));
}

TEST(LaneCandidates, AModelStartsOutWithLanes) {
    const State state = makeState();
    EXPECT_STREQ(vardel_ip_quarzel_get_implementation(state.get()), lanes::bestCandidate().name);
    EXPECT_TRUE(takesLanes(*state, 40));
}

}  // namespace
}  // namespace quarzel::test
