// SPDX-License-Identifier: MIT
// How the entry points choose their kernels: by their own algorithm type, and by the processor.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "engine/kernel_calls.hpp"
#include "engine/probe_engine.hpp"
#include "engine/tables.hpp"
#include "support/capture.hpp"
#include "support/random.hpp"
#include "support/rows.hpp"

namespace quarzel::test {
namespace {

using Probe = ProbeEngine;
using RecursionKernel = T8* (TCalculationEngineModBase::*)(unsigned, const T8*, T8*) const;
using RatioKernel = short* (TCalculationEngineModBase::*)(unsigned, const T8*, const T8*, const T8*,
                                                          short*) const;

struct Kernels {
    AlgorithmType type;
    RecursionKernel alpha;
    RecursionKernel beta;
    RatioKernel llr;
};

const Kernels plainKernels[] = {
    {AlgorithmType::Mod, &Probe::mod_alpha, &Probe::mod_beta, &Probe::mod_llr},
    {AlgorithmType::ModStar, &Probe::modstar_alpha, &Probe::modstar_beta, &Probe::modstar_llr},
    {AlgorithmType::ModHash, &Probe::modhash_alpha, &Probe::modhash_beta, &Probe::modhash_llr},
};

const Kernels sse2Kernels[] = {
    {AlgorithmType::Mod, &Probe::sse2_mod_alpha, &Probe::sse2_mod_beta, &Probe::sse2_mod_llr},
    {AlgorithmType::ModStar, &Probe::sse2_modstar_alpha, &Probe::sse2_modstar_beta, &Probe::sse2_modstar_llr},
    {AlgorithmType::ModHash, &Probe::sse2_modhash_alpha, &Probe::sse2_modhash_beta, &Probe::sse2_modhash_llr},
};

/// An engine with a table of random bytes for each kind of recursion, and random steps.
class EngineDispatch : public testing::Test {
  protected:
    EngineDispatch() {
        engine.itsAlphaLUT = alphaTable.data() + Probe::lutCentre;
        engine.itsBetaLUT = betaTable.data() + Probe::lutCentre;
        engine.itsLLRLUT = llrTable.data() + Probe::lutCentre;
    }

    void setTypes(AlgorithmType alpha, AlgorithmType beta, AlgorithmType llr) {
        engine.itsAlphaAlgorithm = alpha;
        engine.itsBetaAlgorithm = beta;
        engine.itsLLRAlgorithm = llr;
    }

    template <class Kernel>
    std::vector<Row> alphaBy(Kernel kernel) {
        return rows(forward(engine, kernel, steps.gamma, steps.alpha.front()));
    }
    template <class Kernel>
    std::vector<Row> betaBy(Kernel kernel) {
        return rows(backward(engine, kernel, steps.gamma, steps.beta.back()));
    }
    template <class Kernel>
    std::vector<short> llrBy(Kernel kernel) {
        return ratios(engine, kernel, steps);
    }

    std::mt19937 random = seededRandom();
    Table alphaTable = randomTable(random);
    Table betaTable = randomTable(random);
    Table llrTable = randomTable(random);
    Steps steps = randomSteps(random, 100);
    ProbeEngine engine;
};

TEST_F(EngineDispatch, ReadsForEachRecursionItsOwnType) {
    for (const bool sse2 : {false, true}) {
        engine.itsSSE2 = sse2;
        for (const Kernels& forAlpha : plainKernels) {
            for (const Kernels& forBeta : plainKernels) {
                for (const Kernels& forLlr : plainKernels) {
                    setTypes(forAlpha.type, forBeta.type, forLlr.type);
                    EXPECT_EQ(alphaBy(&Probe::alpha), alphaBy(forAlpha.alpha));
                    EXPECT_EQ(betaBy(&Probe::beta), betaBy(forBeta.beta));
                    EXPECT_EQ(llrBy(&Probe::llr), llrBy(forLlr.llr));
                }
            }
        }
    }
}

TEST_F(EngineDispatch, TellsTheThreeAlgorithmsApart) {
    for (std::size_t i = 0; i < 3; ++i) {
        const Kernels& one = plainKernels[i];
        const Kernels& other = plainKernels[(i + 1) % 3];
        EXPECT_NE(alphaBy(one.alpha), alphaBy(other.alpha));
        EXPECT_NE(betaBy(one.beta), betaBy(other.beta));
        EXPECT_NE(llrBy(one.llr), llrBy(other.llr));
    }
}

TEST_F(EngineDispatch, ReadsForEachRecursionItsOwnTable) {
    for (const AlgorithmType type : {AlgorithmType::ModStar, AlgorithmType::ModHash}) {
        setTypes(type, type, type);
        ProbeEngine withAlphaTable(type, alphaTable);
        ProbeEngine withBetaTable(type, betaTable);
        ProbeEngine withLlrTable(type, llrTable);
        EXPECT_EQ(alphaBy(&Probe::alpha),
                  rows(forward(withAlphaTable, &Probe::alpha, steps.gamma, steps.alpha.front())));
        EXPECT_EQ(betaBy(&Probe::beta),
                  rows(backward(withBetaTable, &Probe::beta, steps.gamma, steps.beta.back())));
        EXPECT_EQ(llrBy(&Probe::llr), ratios(withLlrTable, &Probe::llr, steps));
    }
}

TEST_F(EngineDispatch, HasSse2RecursionsWithTheBitsOfThePlainOnes) {
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_EQ(alphaBy(sse2Kernels[i].alpha), alphaBy(plainKernels[i].alpha)) << i;
        EXPECT_EQ(betaBy(sse2Kernels[i].beta), betaBy(plainKernels[i].beta)) << i;
        EXPECT_EQ(llrBy(sse2Kernels[i].llr), llrBy(plainKernels[i].llr)) << i;
    }
}

TEST_F(EngineDispatch, HasBranchMetricsWithTheSameBitsByAnyWay) {
    const std::vector<short> intrinsic = randomWords(random, 200);
    const std::vector<short> parity0 = randomWords(random, 200);
    const std::vector<short> parity1 = randomWords(random, 200);
    const auto gammaBy = [&](auto kernel) {
        std::vector<T8> gamma(200);
        EXPECT_EQ(
            std::invoke(kernel, engine, 200U, intrinsic.data(), parity0.data(), parity1.data(), gamma.data()),
            gamma.data() + 200);
        return rows(gamma);
    };
    const std::vector<Row> plain = gammaBy(&Probe::mod_gamma);
    EXPECT_EQ(gammaBy(&Probe::sse2_mod_gamma), plain);
    for (const bool sse2 : {false, true}) {
        engine.itsSSE2 = sse2;
        for (const int type : {0, 1, 2, 3, 4}) {
            const auto any = static_cast<AlgorithmType>(type);
            setTypes(any, any, any);
            EXPECT_EQ(gammaBy(&Probe::gamma), plain) << type;
        }
    }
}

/// Any value that is no algorithm type.
class IllegalType : public EngineDispatch, public testing::WithParamInterface<int> {
  protected:
    const AlgorithmType illegal = static_cast<AlgorithmType>(GetParam());
    const std::vector<Row> gammaBefore = rows(steps.gamma);
    const std::vector<Row> alphaBefore = rows(steps.alpha);
    const std::vector<Row> betaBefore = rows(steps.beta);

    /// Make a call for either kind of processor; it must write one line, return null and change no metrics.
    template <class Call>
    void expectRefused(const std::string& method, Call call) {
        for (const bool sse2 : {false, true}) {
            engine.itsSSE2 = sse2;
            const Output output = capture([&] { EXPECT_EQ(call(), nullptr); });
            EXPECT_EQ(output.out, "");
            EXPECT_EQ(output.err, "ERROR:TCalculationEngineModBase::" + method + ":Illegal algorithm type\n");
            EXPECT_EQ(rows(steps.gamma), gammaBefore);
            EXPECT_EQ(rows(steps.alpha), alphaBefore);
            EXPECT_EQ(rows(steps.beta), betaBefore);
        }
    }
};

INSTANTIATE_TEST_SUITE_P(EngineDispatch, IllegalType,
                         testing::Values(0, 4, -1, 257, 65537, 2147483647, -2147483647 - 1));

TEST_P(IllegalType, IsRefusedByTheForwardRecursionAlone) {
    setTypes(illegal, AlgorithmType::Mod, AlgorithmType::Mod);
    expectRefused("alpha", [&] { return engine.alpha(100, steps.gamma.data(), steps.alpha.data()); });
    EXPECT_EQ(betaBy(&Probe::beta), betaBy(&Probe::mod_beta));
    EXPECT_EQ(llrBy(&Probe::llr), llrBy(&Probe::mod_llr));
}

TEST_P(IllegalType, IsRefusedByTheBackwardRecursionAlone) {
    setTypes(AlgorithmType::Mod, illegal, AlgorithmType::Mod);
    expectRefused("beta", [&] { return engine.beta(100, &steps.gamma.back(), &steps.beta.back()); });
    EXPECT_EQ(alphaBy(&Probe::alpha), alphaBy(&Probe::mod_alpha));
    EXPECT_EQ(llrBy(&Probe::llr), llrBy(&Probe::mod_llr));
}

TEST_P(IllegalType, IsRefusedByTheLogLikelihoodRatiosAlone) {
    setTypes(AlgorithmType::Mod, AlgorithmType::Mod, illegal);
    std::vector<short> out(100, 77);
    expectRefused("llr", [&] {
        return engine.llr(100, steps.alpha.data(), steps.beta.data(), steps.gamma.data(), out.data());
    });
    EXPECT_EQ(out, std::vector<short>(100, 77));
    EXPECT_EQ(alphaBy(&Probe::alpha), alphaBy(&Probe::mod_alpha));
    EXPECT_EQ(betaBy(&Probe::beta), betaBy(&Probe::mod_beta));
}

TEST_P(IllegalType, IsRefusedEvenForCallsThatWouldWriteNothing) {
    setTypes(illegal, illegal, illegal);
    expectRefused("alpha", [&] { return engine.alpha(1, steps.gamma.data(), steps.alpha.data()); });
    expectRefused("beta", [&] { return engine.beta(1, &steps.gamma.back(), &steps.beta.back()); });
    expectRefused("llr", [&] {
        return engine.llr(0, steps.alpha.data(), steps.beta.data(), steps.gamma.data(), nullptr);
    });
}

}  // namespace
}  // namespace quarzel::test
