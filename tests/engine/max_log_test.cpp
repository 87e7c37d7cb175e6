// SPDX-License-Identifier: MIT
// The max-log kernels on values worked by hand.
#include <gtest/gtest.h>

#include <vector>

#include "engine/kernel_calls.hpp"
#include "engine/probe_engine.hpp"
#include "support/rows.hpp"

namespace quarzel::test {
namespace {

Row alphaStep(const T8& before, const T8& gamma) {
    const ProbeEngine engine;
    return row(forward(engine, &ProbeEngine::mod_alpha, {gamma, T8{}}, before)[1]);
}

Row betaStep(const T8& after, const T8& gamma) {
    const ProbeEngine engine;
    return row(backward(engine, &ProbeEngine::mod_beta, {T8{}, gamma}, after)[0]);
}

int llr(const T8& alpha, const T8& beta, const T8& gamma) {
    const ProbeEngine engine;
    return ratios(engine, &ProbeEngine::mod_llr, {{gamma}, {alpha}, {beta}}).front();
}

TEST(MaxLog, GivesZerosForZeros) {
    EXPECT_EQ(alphaStep({}, {}), Row({}));
    EXPECT_EQ(betaStep({}, {}), Row({}));
    EXPECT_EQ(llr({}, {}, {}), 0);
}

TEST(MaxLog, LetsTheKnownStateReachItsTwoSuccessorsForward) {
    const T8 known = {{0, -16384, -16384, -16384, -16384, -16384, -16384, -16384}};
    EXPECT_EQ(alphaStep(known, {{16, 32, 48, 64}}),
              Row({-16, -16352, -16336, -16320, 16, -16352, -16336, -16320}));
}

TEST(MaxLog, TakesTheLargerOfTwoBranchesForward) {
    const T8 before = {{0, 100, 200, 300, 400, 500, 600, 700}};
    EXPECT_EQ(alphaStep(before, {{10, 20, 30, 40}}), Row({110, 280, 530, 660, 90, 320, 470, 740}));
    EXPECT_EQ(alphaStep(before, {{-10, -20, -30, -40}}), Row({90, 320, 470, 740, 110, 280, 530, 660}));
    EXPECT_EQ(alphaStep(before, {{80, 80, 80, 80}}), Row({180, 280, 580, 680, 80, 380, 480, 780}));
    EXPECT_EQ(alphaStep(before, {{-80, -80, -80, -80}}), Row({80, 380, 480, 780, 180, 280, 580, 680}));
}

TEST(MaxLog, TakesTheLargerOfTwoBranchesBackward) {
    const T8 after = {{0, 100, 200, 300, 400, 500, 600, 700}};
    EXPECT_EQ(betaStep(after, {{10, 20, 30, 40}}), Row({410, 390, 480, 520, 630, 570, 660, 740}));
    EXPECT_EQ(betaStep(after, {{-10, -20, -30, -40}}), Row({390, 410, 520, 480, 570, 630, 740, 660}));
    EXPECT_EQ(betaStep(after, {{300, 300, 300, 300}}), Row({700, 300, 400, 800, 900, 500, 600, 1000}));
}

TEST(MaxLog, AddsEachBranchMetricToItsOwnBranches) {
    EXPECT_EQ(alphaStep({}, {{8, 16, 32, 64}}), Row({8, 16, 32, 64, 8, 16, 32, 64}));
    EXPECT_EQ(alphaStep({}, {{-8, -16, -32, -64}}), Row({8, 16, 32, 64, 8, 16, 32, 64}));
    EXPECT_EQ(betaStep({}, {{8, 16, 32, 64}}), Row({8, 8, 16, 16, 32, 32, 64, 64}));
    EXPECT_EQ(betaStep({}, {{-8, -16, -32, -64}}), Row({8, 8, 16, 16, 32, 32, 64, 64}));
}

TEST(MaxLog, LetsTheWrapDecideWhichMetricIsTheLarger) {
    // State 0 chooses between states 1 and 0, state 4 between 0 and 1; the wrapped difference puts -28672
    // above 28672, by the wrap of 57344 to -8192.
    const Row forwardMetrics = alphaStep({{-28672, 28672}}, {});
    EXPECT_EQ(forwardMetrics[0], -28672);
    EXPECT_EQ(forwardMetrics[4], -28672);
    const Row backwardMetrics = betaStep({{-28672, 0, 0, 0, 28672}}, {});
    EXPECT_EQ(backwardMetrics[0], -28672);
    EXPECT_EQ(backwardMetrics[1], -28672);
}

TEST(MaxLog, TakesTheSecondBranchAtHalfTheCircle) {
    // The first branch of state 0 comes from state 1, that of state 4 from state 0, each with its +g.
    const Row forwardMetrics = alphaStep({{-16384, 16384}}, {});
    EXPECT_EQ(forwardMetrics[0], -16384);
    EXPECT_EQ(forwardMetrics[4], 16384);
    const Row backwardMetrics = betaStep({{-16384, 0, 0, 0, 16384}}, {});
    EXPECT_EQ(backwardMetrics[0], -16384);
    EXPECT_EQ(backwardMetrics[1], 16384);
}

TEST(MaxLog, LetsMetricsWrapAndNeverSaturates) {
    const T8 top = {{32000, 32000, 32000, 32000, 32000, 32000, 32000, 32000}};
    const Row wrapped = {-32536, -32536, -32536, -32536, -32536, -32536, -32536, -32536};
    EXPECT_EQ(alphaStep(top, {{1000, 1000, 1000, 1000}}), wrapped);
    EXPECT_EQ(betaStep(top, {{1000, 1000, 1000, 1000}}), wrapped);
}

TEST(MaxLog, WeighsTheBestPathOfEitherBit) {
    EXPECT_EQ(llr({}, {}, {{10, 20, 30, 40}}), 50);       // 40 - -10
    EXPECT_EQ(llr({}, {}, {{-10, -20, -30, -40}}), -50);  // -10 - 40
    // From state 0 the bit 1 leads to state 4, the bit 0 to state 0.
    const T8 known = {{0, -16384, -16384, -16384, -16384, -16384, -16384, -16384}};
    EXPECT_EQ(llr(known, {{100, 0, 0, 0, 300}}, {}), 200);
    EXPECT_EQ(llr(known, {{100, 0, 0, 0, 300}}, {{-150, 0, 0, 0}}), -100);
}

TEST(MaxLog, WrapsALogLikelihoodRatioBeyond16Bits) {
    EXPECT_EQ(llr({}, {}, {{20000, 20000, 20000, 20000}}), 40000 - 65536);
    EXPECT_EQ(llr({}, {}, {{-20000, -20000, -20000, -20000}}), 65536 - 40000);
    EXPECT_EQ(llr({}, {}, {{16384, 16384, 16384, 16384}}), -32768);
}

TEST(MaxLog, ComparesLevelByLevelInTheTree) {
    // States 2 and 3 stand at 16384, which g1 brings to the top of the range.
    //   R0 = M(0, 32767) = 32767, R1 = M(-1, 1) = 1, R = M(32767, 1) = 32767
    //   S0 = M(0, 1)     = 1,     S1 = M(1, -1) = 1, S = M(1, 1)     = 1
    const T8 alpha = {{0, 0, 16384, 16384}};
    EXPECT_EQ(llr(alpha, {}, {{0, 16383, -1, 1}}), 32766);
    // One more wraps. At half the circle the second is taken, and -32768 against 1 counts as the larger.
    //   R0 = M(0, -32768) = -32768, R1 = 1, R = M(-32768, 1) = -32768
    //   S0 = M(0, 0)      = 0,      S1 = 1, S = M(0, 1)      = 1
    EXPECT_EQ(llr(alpha, {}, {{0, 16384, -1, 1}}), 32767);
}

TEST(MaxLog, CarriesMetricsOverManySteps) {
    const ProbeEngine engine;
    const std::vector<T8> gamma(4, T8{{16, 32, 48, 64}});
    const std::vector<Row> alpha = rows(forward(engine, &ProbeEngine::mod_alpha, gamma, {}));
    EXPECT_EQ(alpha, std::vector<Row>({{0, 0, 0, 0, 0, 0, 0, 0},
                                       {16, 32, 48, 64, 16, 32, 48, 64},
                                       {48, 80, 80, 112, 32, 96, 64, 128},
                                       {96, 112, 144, 128, 64, 144, 80, 192}}));
    const std::vector<Row> beta = rows(backward(engine, &ProbeEngine::mod_beta, gamma, {}));
    EXPECT_EQ(beta, std::vector<Row>({{128, 96, 64, 112, 144, 96, 144, 192},
                                      {64, 32, 48, 80, 112, 80, 96, 128},
                                      {16, 16, 32, 32, 48, 48, 64, 64},
                                      {0, 0, 0, 0, 0, 0, 0, 0}}));
}

}  // namespace
}  // namespace quarzel::test
