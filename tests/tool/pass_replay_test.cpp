// SPDX-License-Identifier: MIT
#include "coverage/pass_replay.hpp"

#include <gtest/gtest.h>

#include <span>
#include <stdexcept>
#include <vector>

#include "quarzel/core.hpp"

namespace quarzel::test {

namespace {

using tool::Event;

/// Decode a block and hand each pass, which may be changed before, to a replay.
template <class Change>
tool::EventCounts replay(const std::vector<std::int8_t>& soft, int units, int algorithm, int iterations,
                         const Change& change) {
    Core core(CoreSettings{units, algorithm});
    tool::PassReplay replay(static_cast<std::uint32_t>(units), algorithm);
    const unsigned passes = 2 * static_cast<unsigned>(iterations);
    core.passes(passes, [&](const vardel_ip_quarzel_pass& pass) {
        vardel_ip_quarzel_pass copy = pass;
        change(copy);
        replay.add(copy, pass.pass + 1 == passes);
    });
    const std::size_t positions = soft.size() / 3;
    std::vector<unsigned char> bits(positions - tailPositions);
    core.decode(softBlocks(std::span(soft), positions), iterations, bits);
    return replay.counts();
}

tool::EventCounts replay(const std::vector<std::int8_t>& soft, int units, int algorithm, int iterations) {
    return replay(soft, units, algorithm, iterations, [](const vardel_ip_quarzel_pass&) {});
}

std::vector<std::int8_t> constantBlock(std::size_t K, std::int8_t value) {
    return std::vector<std::int8_t>(3 * (K + tailPositions), value);
}

using Counts = std::vector<std::size_t>;

}  // namespace

// Forward metrics are 0 at state 0 and -1024 elsewhere at first, at all states from the third step on: until
// then the states differ in how often their candidates are equal. Backward metrics are 0 everywhere, and the
// recursion has a step less. All is done twice, once for each code.
TEST(PassReplay, CountsTheTiesOfABlockOfZeros) {
    const tool::EventCounts counts = replay(constantBlock(40, 0), 2, 0, 1);
    EXPECT_EQ(counts.of(Event::alphaTie), (Counts{74, 78, 76, 78, 74, 78, 76, 78}));
    EXPECT_EQ(counts.of(Event::betaTie), Counts(8, 78));
    EXPECT_EQ(counts.of(Event::zeroRatio), Counts{40});
    for (const Event event : {Event::branchAbove, Event::branchBelow, Event::aPrioriFloor, Event::alphaWrap,
                              Event::alphaOrder, Event::betaMask, Event::tailMask, Event::pathWrap}) {
        for (const std::size_t count : counts.of(event)) {
            EXPECT_EQ(count, 0U) << tool::eventFacts()[static_cast<std::size_t>(event)].name;
        }
    }
}

// With 100 everywhere x + p is 200 and x - p is 0 in the first pass; the tail's sums are 200 times -3, -1, 1
// and so on or 0, of which 3 low bits are lost where they are no multiples of 8.
TEST(PassReplay, CountsBranchMetricsThatAreLimited) {
    const tool::EventCounts high = replay(constantBlock(40, 100), 4, 0, 1);
    EXPECT_GE(high.of(Event::branchAbove)[2], 40U);
    EXPECT_EQ(high.of(Event::branchAbove)[2], high.of(Event::branchAbove)[3]);
    EXPECT_EQ(high.of(Event::branchBelow), Counts(4, 0));
    const tool::EventCounts low = replay(constantBlock(40, -100), 4, 0, 1);
    EXPECT_GE(low.of(Event::branchBelow)[2], 40U);
    EXPECT_EQ(low.of(Event::branchAbove), Counts(4, 0));
}

// A core of 2 units cuts 1152 steps into 8 segments of three windows; the segment of 1024 steps has two.
TEST(PassReplay, TellsWhichPassABoundaryIsOf) {
    std::vector<std::int8_t> soft = constantBlock(1152, 8);
    for (std::size_t i = 0; i < soft.size(); i += 3) {
        soft[i] = static_cast<std::int8_t>(i % 61 - 30);
    }
    EXPECT_GT(replay(soft, 2, 1, 3).of(Event::betaSamePass)[0], 0U);
    soft.resize(3 * (1024 + tailPositions));
    const tool::EventCounts counts = replay(soft, 2, 1, 3);
    EXPECT_EQ(counts.of(Event::betaSamePass)[0], 0U);
    EXPECT_GT(counts.of(Event::betaNextPass)[0], 0U);
    EXPECT_GT(counts.of(Event::betaNextPass)[1], 0U);
    const tool::EventCounts first = replay(soft, 2, 1, 1);
    EXPECT_EQ(first.of(Event::betaNextPass), Counts(2, 0)) << "the first iteration has no boundaries";
    EXPECT_EQ(first.of(Event::alphaNextPass), Counts(2, 0));
}

TEST(PassReplay, RefusesValuesThatDoNotFollowFromOneAnother) {
    const std::vector<std::int8_t> soft = constantBlock(128, 5);
    using Pass = vardel_ip_quarzel_pass;
    const std::vector<std::pair<const std::int16_t * Pass::*, std::size_t>> signals = {
        {&Pass::intrinsic, 1}, {&Pass::alpha, 8}, {&Pass::beta, 8},
        {&Pass::gamma, 4},     {&Pass::llr, 1},   {&Pass::extrinsic, 1}};
    for (const int algorithm : {0, 1, 2}) {
        for (const auto& [signal, width] : signals) {
            for (const std::size_t step : {0U, 64U, 127U}) {
                std::vector<std::int16_t> changed;
                const auto change = [&, member = signal, count = width](Pass& pass) {
                    changed.assign(pass.*member, pass.*member + count * pass.steps);
                    changed[step * count] = static_cast<std::int16_t>(changed[step * count] ^ 16);
                    pass.*member = changed.data();
                };
                EXPECT_THROW(replay(soft, 2, algorithm, 1, change), std::logic_error)
                    << algorithm << ' ' << step;
            }
        }
    }
}

}  // namespace quarzel::test
