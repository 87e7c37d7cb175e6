// SPDX-License-Identifier: MIT
// The kernels on the stored calls: every algorithm, four pairs of formats and tables.
#include <gtest/gtest.h>

#include <memory>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "engine/engine.hpp"
#include "engine/kernel_calls.hpp"
#include "engine/probe_engine.hpp"
#include "fixed/number_format.hpp"
#include "support/engine_setup.hpp"
#include "support/rows.hpp"
#include "support/vectors.hpp"

namespace quarzel::test {
namespace {

using Words = std::vector<short>;

T8 record(const Words& words) {
    T8 result{};
    std::copy(words.begin(), words.end(), result.element);
    return result;
}

/// The stored records, in the form of computed ones; branch metrics have no more than four elements.
std::vector<Row> storedRows(const nlohmann::json& stored) {
    std::vector<Row> result;
    for (const auto& words : stored) {
        result.push_back(row(record(words.get<Words>())));
    }
    return result;
}

void expectStored(TCalculationEngine& engine, const nlohmann::json& stored) {
    const auto intrinsic = stored.at("intrinsic").get<Words>();
    const auto parity0 = stored.at("parity0").get<Words>();
    const auto parity1 = stored.at("parity1").get<Words>();
    const auto n = static_cast<unsigned>(intrinsic.size());
    Steps steps;
    steps.gamma.resize(n);
    EXPECT_EQ(engine.gamma(n, intrinsic.data(), parity0.data(), parity1.data(), steps.gamma.data()),
              steps.gamma.data() + n);
    EXPECT_EQ(rows(steps.gamma), storedRows(stored.at("gamma")));

    const T8 first = record(stored.at("alpha_first").get<Words>());
    const T8 last = record(stored.at("beta_last").get<Words>());
    steps.alpha = forward(engine, &TCalculationEngine::alpha, steps.gamma, first);
    EXPECT_EQ(rows(steps.alpha), storedRows(stored.at("alpha")));
    steps.beta = backward(engine, &TCalculationEngine::beta, steps.gamma, last);
    EXPECT_EQ(rows(steps.beta), storedRows(stored.at("beta")));
    EXPECT_EQ(ratios(engine, &TCalculationEngine::llr, steps), stored.at("llr").get<Words>());
}

/// The stored cases of one algorithm, of which there are twelve.
std::vector<nlohmann::json> casesOf(const std::string& algorithm) {
    std::vector<nlohmann::json> cases;
    for (auto& stored : readCases("kernels.jsonl")) {
        if (stored.at("algorithm") == algorithm) {
            cases.push_back(std::move(stored));
        }
    }
    EXPECT_EQ(cases.size(), 12U);
    return cases;
}

/// Run an engine made by its factory.
void expectStoredBy(const std::string& properties, const nlohmann::json& stored) {
    const EngineSetup setup(properties, stored.at("state_format"), stored.at("gamma_format"));
    expectStored(*setup.engine, stored);
}

TEST(StoredKernels, OfMaxLogAreEqual) {
    for (const auto& stored : casesOf("MOD")) {
        expectStoredBy("MOD", stored);
    }
}

TEST(StoredKernels, OfDeferredMaxStarAreEqual) {
    for (const auto& stored : casesOf("MOD#")) {
        expectStoredBy("MOD#:" + std::to_string(stored.at("points").get<unsigned>()), stored);
    }
}

TEST(StoredKernels, OfMaxStarAreEqual) {
    for (const auto& stored : casesOf("MOD*")) {
        const std::unique_ptr<TNumberFormat> state(TNumberFormat::create(stored.at("state_format")));
        const std::unique_ptr<TNumberFormat> branch(TNumberFormat::create(stored.at("gamma_format")));
        ProbeEngine engine(*state, *branch);
        engine.use(AlgorithmType::ModStar,
                   TCalculationEngineModBase::createLUT(stored.at("points").get<unsigned>(), state.get()));
        for (const bool sse2 : {false, true}) {
            engine.itsSSE2 = sse2;
            expectStored(engine, stored);
        }
    }
}

}  // namespace
}  // namespace quarzel::test
