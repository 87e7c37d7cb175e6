// SPDX-License-Identifier: MIT
// The kernels against a second writing of their recursions, on random metrics and tables.
#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "engine/kernel_calls.hpp"
#include "engine/probe_engine.hpp"
#include "engine/reference_kernels.hpp"
#include "engine/tables.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

using Walk = std::vector<Row> (*)(const Table&, const std::array<reference::Candidates, 8>&,
                                  const std::vector<T8>&, const T8&);
using Ratio = int (*)(const Table&, const T8&, const T8&, const T8&);

/// An algorithm type with its reference and a table to try it with.
struct Comparison {
    const char* name;
    AlgorithmType type;
    Walk walk;
    Ratio ratio;
    Table (*table)(std::mt19937&);
};

Table noCorrections(std::mt19937&) {
    return zeroTable();
}

Table ofTheCore(std::mt19937&) {
    return coreTable();
}

const Comparison comparisons[] = {
    {"MaxLog", AlgorithmType::Mod, reference::maxStarWalk, reference::maxStarRatio, noCorrections},
    {"MaxStar", AlgorithmType::ModStar, reference::maxStarWalk, reference::maxStarRatio, ofTheCore},
    {"MaxStarOfAnyTable", AlgorithmType::ModStar, reference::maxStarWalk, reference::maxStarRatio,
     randomTable},
    {"DeferredMaxStar", AlgorithmType::ModHash, reference::deferredWalk, reference::deferredRatio, ofTheCore},
    {"DeferredMaxStarOfAnyTable", AlgorithmType::ModHash, reference::deferredWalk, reference::deferredRatio,
     randomTable},
};

void PrintTo(const Comparison& comparison, std::ostream* stream) {
    *stream << comparison.name;
}

class AgainstReference : public testing::TestWithParam<Comparison> {
  protected:
    AgainstReference() { engine.use(GetParam().type, table); }

    std::mt19937 random = seededRandom();
    Table table = GetParam().table(random);
    ProbeEngine engine;
    const std::vector<Steps> inputs = {randomSteps(random, 2000), closeSteps(random, 2000),
                                       randomSteps(random, 1), closeSteps(random, 2), closeSteps(random, 3)};
};

INSTANTIATE_TEST_SUITE_P(Algorithms, AgainstReference, testing::ValuesIn(comparisons),
                         [](const auto& param) { return param.param.name; });

TEST_P(AgainstReference, ForwardMetricsAreEqual) {
    for (const Steps& steps : inputs) {
        const T8& first = steps.alpha.front();
        EXPECT_EQ(rows(forward(engine, &ProbeEngine::alpha, steps.gamma, first)),
                  GetParam().walk(table, reference::forwardCandidates, steps.gamma, first));
    }
}

TEST_P(AgainstReference, BackwardMetricsAreEqual) {
    for (const Steps& steps : inputs) {
        const T8& last = steps.beta.back();
        const std::vector<T8> walkedGamma(steps.gamma.rbegin(), steps.gamma.rend());
        std::vector<Row> expected = GetParam().walk(table, reference::backwardCandidates, walkedGamma, last);
        std::reverse(expected.begin(), expected.end());
        EXPECT_EQ(rows(backward(engine, &ProbeEngine::beta, steps.gamma, last)), expected);
    }
}

TEST_P(AgainstReference, LogLikelihoodRatiosAreEqual) {
    for (const Steps& steps : inputs) {
        const std::vector<short> llr = ratios(engine, &ProbeEngine::llr, steps);
        for (std::size_t k = 0; k < llr.size(); ++k) {
            ASSERT_EQ(llr[k], GetParam().ratio(table, steps.alpha[k], steps.beta[k], steps.gamma[k])) << k;
        }
    }
}

}  // namespace
}  // namespace quarzel::test
