// SPDX-License-Identifier: MIT
// Which entries the kernels write and read: guards around the arrays must keep what they held.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "engine/kernel_calls.hpp"
#include "engine/probe_engine.hpp"
#include "engine/tables.hpp"
#include "support/random.hpp"
#include "support/rows.hpp"

namespace quarzel::test {
namespace {

constexpr unsigned guard = 4;  // entries on either side of an array

class KernelExtent : public testing::TestWithParam<AlgorithmType> {
  protected:
    KernelExtent() { engine.use(GetParam(), coreTable()); }

    /// Arrays of n steps between guards; everything, results included, starts random.
    void prepare(unsigned n) {
        steps = randomSteps(random, guard + n + guard);
        before = steps;
    }

    /// The first entry of an array between its guards.
    static T8* start(std::vector<T8>& records) { return records.data() + guard; }

    /// Expect that all entries but those from `first` to before `end`, counted without the guards, are
    /// unchanged, and that those differ from what they held.
    static void expectWritten(const std::vector<T8>& now, const std::vector<T8>& then, unsigned first,
                              unsigned end) {
        for (unsigned i = 0; i < now.size(); ++i) {
            const bool inside = i >= guard + first && i < guard + end;
            EXPECT_EQ(row(now[i]) != row(then[i]), inside) << "entry " << i << " less " << guard;
        }
    }

    std::mt19937 random = seededRandom();
    ProbeEngine engine;
    Steps steps;
    Steps before;
};

std::string kernelName(const testing::TestParamInfo<AlgorithmType>& algorithm) {
    const char* const names[] = {"MaxLog", "MaxStar", "DeferredMaxStar"};
    return names[static_cast<int>(algorithm.param) - 1];
}

INSTANTIATE_TEST_SUITE_P(Algorithms, KernelExtent,
                         testing::Values(AlgorithmType::Mod, AlgorithmType::ModStar, AlgorithmType::ModHash),
                         kernelName);

TEST_P(KernelExtent, OfTheForwardRecursionIsEveryEntryAfterTheFirst) {
    for (const unsigned n : {1U, 2U, 3U, 17U}) {
        prepare(n);
        T8* const alpha = start(steps.alpha);
        EXPECT_EQ(engine.alpha(n, start(steps.gamma), alpha), alpha + n);
        expectWritten(steps.alpha, before.alpha, 1, n);
        expectWritten(steps.gamma, before.gamma, 0, 0);
    }
}

TEST_P(KernelExtent, OfTheBackwardRecursionIsEveryEntryBeforeTheLast) {
    for (const unsigned n : {1U, 2U, 3U, 17U}) {
        prepare(n);
        T8* const last = start(steps.beta) + (n - 1);
        EXPECT_EQ(engine.beta(n, start(steps.gamma) + (n - 1), last), start(steps.beta) - 1);
        expectWritten(steps.beta, before.beta, 0, n - 1);
        expectWritten(steps.gamma, before.gamma, 0, 0);
    }
}

TEST_P(KernelExtent, OfTheLogLikelihoodRatiosIsOneWordAStep) {
    for (const unsigned n : {0U, 1U, 2U, 17U}) {
        prepare(n);
        const std::vector<short> outBefore = randomWords(random, guard + n + guard);
        std::vector<short> out = outBefore;
        short* const first = out.data() + guard;
        EXPECT_EQ(engine.llr(n, start(steps.alpha), start(steps.beta), start(steps.gamma), first), first + n);
        for (unsigned i = 0; i < out.size(); ++i) {
            if (i < guard || i >= guard + n) {
                EXPECT_EQ(out[i], outBefore[i]) << i;
            }
        }
        const std::vector<short> written(first, first + n);
        std::fill(out.begin(), out.end(), short{0});
        engine.llr(n, start(steps.alpha), start(steps.beta), start(steps.gamma), first);
        EXPECT_EQ(std::vector<short>(first, first + n), written);
        expectWritten(steps.alpha, before.alpha, 0, 0);
        expectWritten(steps.beta, before.beta, 0, 0);
        expectWritten(steps.gamma, before.gamma, 0, 0);
    }
}

TEST_P(KernelExtent, OfTheBranchMetricsIsTheFirstFourElementsOfARecordAStep) {
    for (const unsigned n : {0U, 1U, 2U, 17U}) {
        prepare(n);
        const std::vector<short> intrinsic(n, 100);
        const std::vector<short> parity0(n, 20);
        const std::vector<short> parity1(n, 3);
        T8* const gamma = start(steps.gamma);
        EXPECT_EQ(engine.gamma(n, intrinsic.data(), parity0.data(), parity1.data(), gamma), gamma + n);
        std::vector<T8> expected = before.gamma;
        for (unsigned i = guard; i < guard + n; ++i) {
            expected[i][0] = 223;
            expected[i][1] = 183;
            expected[i][2] = 177;
            expected[i][3] = 217;
        }
        EXPECT_EQ(rows(steps.gamma), rows(expected));
    }
}

TEST_P(KernelExtent, LeavesOutTheBranchMetricsOfTheStepBeyondTheRecursions) {
    prepare(9);
    const std::vector<T8> gamma(start(steps.gamma), start(steps.gamma) + 9);
    std::vector<T8> otherLast = gamma;
    otherLast.back() = randomRecord(random);
    std::vector<T8> otherFirst = gamma;
    otherFirst.front() = randomRecord(random);
    const T8 known = steps.alpha[0];
    EXPECT_EQ(rows(forward(engine, &ProbeEngine::alpha, gamma, known)),
              rows(forward(engine, &ProbeEngine::alpha, otherLast, known)));
    EXPECT_EQ(rows(backward(engine, &ProbeEngine::beta, gamma, known)),
              rows(backward(engine, &ProbeEngine::beta, otherFirst, known)));
}

TEST_P(KernelExtent, LeavesOutTheLastFourElementsOfBranchMetrics) {
    prepare(20);
    Steps other = steps;
    for (T8& record : other.gamma) {
        for (unsigned i = 4; i < 8; ++i) {
            record[i] = randomWord(random);
        }
    }
    const T8 known = steps.alpha[0];
    EXPECT_EQ(rows(forward(engine, &ProbeEngine::alpha, steps.gamma, known)),
              rows(forward(engine, &ProbeEngine::alpha, other.gamma, known)));
    EXPECT_EQ(rows(backward(engine, &ProbeEngine::beta, steps.gamma, known)),
              rows(backward(engine, &ProbeEngine::beta, other.gamma, known)));
    EXPECT_EQ(ratios(engine, &ProbeEngine::llr, steps), ratios(engine, &ProbeEngine::llr, other));
}

}  // namespace
}  // namespace quarzel::test
