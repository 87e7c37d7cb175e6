// SPDX-License-Identifier: MIT
// The two max-star algorithms on values worked by hand. The core's table adds 96 at differences -64 to 63 and
// 64 at 64 to 127 and -128 to -65.
#include <gtest/gtest.h>

#include <vector>

#include "engine/kernel_calls.hpp"
#include "engine/probe_engine.hpp"
#include "engine/tables.hpp"
#include "support/rows.hpp"

namespace quarzel::test {
namespace {

/// A record of eight equal metrics.
T8 all(short metric) {
    return {{metric, metric, metric, metric, metric, metric, metric, metric}};
}

Row allRow(short metric) {
    return row(all(metric));
}

const std::vector<T8> noBranchMetrics(4, T8{});

class MaxStar : public testing::Test {
  protected:
    std::vector<Row> alpha(const T8& first, const std::vector<T8>& gamma = noBranchMetrics) {
        return rows(forward(engine, &ProbeEngine::modstar_alpha, gamma, first));
    }
    std::vector<Row> beta(const T8& last, const std::vector<T8>& gamma = noBranchMetrics) {
        return rows(backward(engine, &ProbeEngine::modstar_beta, gamma, last));
    }
    int llr(const T8& a, const T8& b, const T8& g) {
        return ratios(engine, &ProbeEngine::modstar_llr, {{g}, {a}, {b}}).front();
    }

    ProbeEngine engine{AlgorithmType::ModStar, coreTable()};
};

TEST_F(MaxStar, AddsTheLargestCorrectionToEqualMetricsAtEveryStep) {
    EXPECT_EQ(alpha(all(0)), std::vector<Row>({allRow(0), allRow(96), allRow(192), allRow(288)}));
    EXPECT_EQ(beta(all(0)), std::vector<Row>({allRow(288), allRow(192), allRow(96), allRow(0)}));
    EXPECT_EQ(alpha(all(-500))[1], allRow(-404));
}

TEST_F(MaxStar, ReadsTheEntryOfTheSignedDifference) {
    // State 0 compares state 1 with state 0, state 4 the other way round.
    EXPECT_EQ(alpha({{0, 64}})[1], Row({64 + 64, 96, 96, 96, 64 + 96, 96, 96, 96}));
    EXPECT_EQ(beta({{0, 0, 0, 0, 64}})[2], Row({64 + 64, 64 + 96, 96, 96, 96, 96, 96, 96}));
}

TEST_F(MaxStar, AddsNothingToMetricsFarApart) {
    EXPECT_EQ(alpha({{0, 384}})[1], Row({384, 96, 96, 96, 384 + 16, 96, 96, 96}));
    EXPECT_EQ(alpha({{0, 385}})[1], Row({385, 96, 96, 96, 385, 96, 96, 96}));
}

TEST_F(MaxStar, WrapsACorrectedMetric) {
    EXPECT_EQ(alpha(all(32700))[1], allRow(32700 + 96 - 65536));
    EXPECT_EQ(beta(all(32700))[2], allRow(32700 + 96 - 65536));
}

TEST_F(MaxStar, CorrectsEveryLevelOfTheTree) {
    EXPECT_EQ(llr({}, {}, {}), 0);
    // All P and Q are 96.
    //   R0 = M*(160, 96) = 224, R1 = M*(96, 96) = 192, R = M*(224, 192) = 320
    //   S0 = M*(32, 96)  = 192, S1 = 192,              S = M*(192, 192) = 288
    EXPECT_EQ(llr({}, {}, {{64, 0, 0, 0}}), 320 - 288);
}

class DeferredMaxStar : public testing::Test {
  protected:
    std::vector<Row> alpha(const T8& first, const std::vector<T8>& gamma = noBranchMetrics) {
        return rows(forward(engine, &ProbeEngine::modhash_alpha, gamma, first));
    }
    std::vector<Row> beta(const T8& last, const std::vector<T8>& gamma = noBranchMetrics) {
        return rows(backward(engine, &ProbeEngine::modhash_beta, gamma, last));
    }
    int llr(const T8& a, const T8& b, const T8& g) {
        return ratios(engine, &ProbeEngine::modhash_llr, {{g}, {a}, {b}}).front();
    }

    ProbeEngine engine{AlgorithmType::ModHash, coreTable()};
};

TEST_F(DeferredMaxStar, AddsACorrectionOneStepLater) {
    EXPECT_EQ(alpha(all(0)), std::vector<Row>({allRow(0), allRow(0), allRow(96), allRow(192)}));
    EXPECT_EQ(beta(all(0)), std::vector<Row>({allRow(192), allRow(96), allRow(0), allRow(0)}));
}

TEST_F(DeferredMaxStar, AddsTheCorrectionOfTheStateThatWasChosen) {
    // After one step state 4 has 64 pending, all others 96.
    EXPECT_EQ(alpha({{64}}, {T8{}, T8{}, T8{}}),
              std::vector<Row>({{64, 0, 0, 0, 0, 0, 0, 0},
                                {64, 0, 0, 0, 64, 0, 0, 0},
                                {64 + 96, 96, 64 + 64, 96, 64 + 96, 96, 64 + 64, 96}}));
    // Backward it is state 1: it compares 64 with 0, while state 0 compares 0 with 64.
    EXPECT_EQ(beta({{64}}, {T8{}, T8{}, T8{}}),
              std::vector<Row>({{64 + 96, 64 + 96, 64 + 64, 64 + 64, 96, 96, 96, 96},
                                {64, 64, 0, 0, 0, 0, 0, 0},
                                {64, 0, 0, 0, 0, 0, 0, 0}}));
}

TEST_F(DeferredMaxStar, BeginsEveryCallWithoutPendingCorrections) {
    const std::vector<Row> first = alpha(all(0));
    EXPECT_EQ(first[3], allRow(192));
    EXPECT_EQ(alpha(all(192))[1], allRow(192));
    EXPECT_EQ(beta(all(192))[2], allRow(192));
}

TEST_F(DeferredMaxStar, DropsTheCorrectionsOfTheLastStep) {
    const Steps steps{std::vector<T8>(2, T8{{100, -30, 7, 64}}), {{{1, 22, 33, 4, 5, 66, 7, 88}}}, {}};
    const T8& known = steps.alpha.front();
    EXPECT_EQ(rows(forward(engine, &ProbeEngine::modhash_alpha, steps.gamma, known)),
              rows(forward(engine, &ProbeEngine::mod_alpha, steps.gamma, known)));
    EXPECT_EQ(rows(backward(engine, &ProbeEngine::modhash_beta, steps.gamma, known)),
              rows(backward(engine, &ProbeEngine::mod_beta, steps.gamma, known)));
}

TEST_F(DeferredMaxStar, AddsBothCorrectionsAtTheLastLevelOfTheTree) {
    EXPECT_EQ(llr({}, {}, {}), 0);
    // All P and Q are 0 with 96 pending.
    //   R0 = 64 + 96 with 64 pending, R1 = 96 with 96 pending, R = 160 + 64 + T[64] = 288
    //   S0 = 0 + 96 with 96 pending,  S1 = 96 with 96 pending, S = 96 + 96 + T[0]   = 288
    EXPECT_EQ(llr({}, {}, {{64, 0, 0, 0}}), 0);
    // R0 = 128 + 96 with 48 pending, R = 224 + 48 + T[128] = 320
    // S0 = 96 with 64 pending, S = 96 + 64 + T[0] = 256
    EXPECT_EQ(llr({}, {}, {{128, 0, 0, 0}}), 320 - 256);
}

class WithoutCorrections : public testing::Test {
  protected:
    std::mt19937 random = seededRandom();
    ProbeEngine engine{AlgorithmType::ModHash, zeroTable()};
};

TEST_F(WithoutCorrections, BothMaxStarAlgorithmsAreMaxLog) {
    for (const Steps& steps : {randomSteps(random, 500), closeSteps(random, 500)}) {
        const T8& first = steps.alpha.front();
        const T8& last = steps.beta.back();
        const auto alpha = rows(forward(engine, &ProbeEngine::mod_alpha, steps.gamma, first));
        const auto beta = rows(backward(engine, &ProbeEngine::mod_beta, steps.gamma, last));
        const auto llr = ratios(engine, &ProbeEngine::mod_llr, steps);
        EXPECT_EQ(rows(forward(engine, &ProbeEngine::modhash_alpha, steps.gamma, first)), alpha);
        EXPECT_EQ(rows(forward(engine, &ProbeEngine::modstar_alpha, steps.gamma, first)), alpha);
        EXPECT_EQ(rows(backward(engine, &ProbeEngine::modhash_beta, steps.gamma, last)), beta);
        EXPECT_EQ(rows(backward(engine, &ProbeEngine::modstar_beta, steps.gamma, last)), beta);
        EXPECT_EQ(ratios(engine, &ProbeEngine::modhash_llr, steps), llr);
        EXPECT_EQ(ratios(engine, &ProbeEngine::modstar_llr, steps), llr);
    }
}

}  // namespace
}  // namespace quarzel::test
