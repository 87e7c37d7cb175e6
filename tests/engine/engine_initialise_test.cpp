// SPDX-License-Identifier: MIT
// What the engines say and select when they are initialised.
#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>

#include "engine/cpu_features.hpp"
#include "engine/engine_mod.hpp"
#include "engine/engine_mod_hash.hpp"
#include "engine/kernel_calls.hpp"
#include "engine/probe_engine.hpp"
#include "support/capture.hpp"

namespace quarzel::test {
namespace {

const std::string widthWarning =
    "WARNING:The state number format is set to maximum bit width. Note that this will cause a 1-bit "
    "truncation "
    "during intrinsic calculations\n";
const std::string pointsLine =
    "ERROR:TCalculationEngineModBase::createLUT:Number of points must be a binary number\n";
const std::string binaryPointLine =
    "ERROR:TCalculationEngineModBase::createLUT:Binary point of state metrics is incompatible with 8 bit "
    "lookup tables\n";

TEST(EngineBase, WarnsOfAStateFormatThatHasNoBitsInAWord) {
    for (std::uint32_t nbits = 0; nbits <= 32; ++nbits) {
        ProbeEngine engine(TNumberFormat(nbits, 3), coreBranch);
        bool usable = false;
        const Output output = capture([&] { usable = engine.initialise(); });
        EXPECT_TRUE(usable) << nbits;
        EXPECT_EQ(output.out, nbits >= 1 && nbits <= 16 ? "" : widthWarning) << nbits;
        EXPECT_EQ(output.err, "") << nbits;
    }
}

TEST(EngineBase, StartsAsMaxLogWithoutTables) {
    const ProbeEngine engine;
    EXPECT_EQ(engine.itsAlphaAlgorithm, AlgorithmType::Mod);
    EXPECT_EQ(engine.itsBetaAlgorithm, AlgorithmType::Mod);
    EXPECT_EQ(engine.itsLLRAlgorithm, AlgorithmType::Mod);
    EXPECT_EQ(engine.itsAlphaLUT, nullptr);
    EXPECT_EQ(engine.itsBetaLUT, nullptr);
    EXPECT_EQ(engine.itsLLRLUT, nullptr);
}

TEST(EngineBase, KnowsWhetherTheProcessorHasSse2) {
    EXPECT_EQ(ProbeEngine().itsSSE2, hasSSE2());
#ifdef __x86_64__
    EXPECT_TRUE(hasSSE2());
#endif
}

/// A max-log engine that lets a test look inside.
class OpenMod : public TCalculationEngineMod {
  public:
    using TCalculationEngineModBase::itsAlphaAlgorithm;
    using TCalculationEngineModBase::itsAlphaLUT;
    using TCalculationEngineModBase::itsBetaAlgorithm;
    using TCalculationEngineModBase::itsBetaLUT;
    using TCalculationEngineModBase::itsLLRAlgorithm;
    using TCalculationEngineModBase::itsLLRLUT;
};

TEST(MaxLogEngine, SelectsMaxLogWithoutTables) {
    const unsigned char entry = 0;
    OpenMod engine;
    engine.itsAlphaAlgorithm = AlgorithmType::ModStar;
    engine.itsBetaAlgorithm = AlgorithmType::ModHash;
    engine.itsLLRAlgorithm = static_cast<AlgorithmType>(9);
    engine.itsAlphaLUT = engine.itsBetaLUT = engine.itsLLRLUT = &entry;
    EXPECT_TRUE(engine.initialise());
    EXPECT_EQ(engine.itsAlphaAlgorithm, AlgorithmType::Mod);
    EXPECT_EQ(engine.itsBetaAlgorithm, AlgorithmType::Mod);
    EXPECT_EQ(engine.itsLLRAlgorithm, AlgorithmType::Mod);
    EXPECT_EQ(engine.itsAlphaLUT, nullptr);
    EXPECT_EQ(engine.itsBetaLUT, nullptr);
    EXPECT_EQ(engine.itsLLRLUT, nullptr);
}

TEST(MaxLogEngine, DoesNotWarnOfAnyWidth) {
    for (const std::uint32_t nbits : {0U, 12U, 16U, 17U, 32U}) {
        const TNumberFormat state(nbits, 3);
        const std::unique_ptr<TCalculationEngine> engine(TCalculationEngineMod::create(""));
        engine->setFormats(&coreBranch, &state, &coreBranch);
        const Output output = capture([&] { EXPECT_TRUE(engine->initialise()); });
        EXPECT_EQ(output.out + output.err, "") << nbits;
    }
}

/// A table engine in a given state format, not yet initialised.
struct TableEngine {
    TNumberFormat state;
    std::unique_ptr<TCalculationEngineModHash> engine;

    TableEngine(const std::string& points, const TNumberFormat& format)
        : state(format), engine(TCalculationEngineModHash::create(points)) {
        engine->setFormats(&coreBranch, &state, &coreBranch);
    }
};

/// Whether an engine computes as another one does.
void expectSameKernels(TCalculationEngine& engine, TCalculationEngine& other) {
    std::mt19937 random = seededRandom();
    const Steps steps = closeSteps(random, 200);
    const auto alpha = &TCalculationEngine::alpha;
    const auto beta = &TCalculationEngine::beta;
    const auto llr = &TCalculationEngine::llr;
    EXPECT_EQ(rows(forward(engine, alpha, steps.gamma, steps.alpha.front())),
              rows(forward(other, alpha, steps.gamma, steps.alpha.front())));
    EXPECT_EQ(rows(backward(engine, beta, steps.gamma, steps.beta.back())),
              rows(backward(other, beta, steps.gamma, steps.beta.back())));
    EXPECT_EQ(ratios(engine, llr, steps), ratios(other, llr, steps));
}

TEST(TableEngineInitialise, BuildsTheTableOfItsPointsAndDefersItsCorrections) {
    for (const unsigned points : {0U, 1U, 4U, 16U, 256U, 65536U}) {
        TableEngine table(std::to_string(points), coreState);
        const Output output = capture([&] { EXPECT_TRUE(table.engine->initialise()); });
        EXPECT_EQ(output.out + output.err, "") << points;
        ProbeEngine expected(AlgorithmType::ModHash,
                             TCalculationEngineModBase::createLUT(points, &coreState));
        expectSameKernels(*table.engine, expected);
    }
}

TEST(TableEngineInitialise, TakesTheFullTableWithoutANumberOfPoints) {
    TableEngine table("", coreState);
    EXPECT_TRUE(table.engine->initialise());
    ProbeEngine expected(AlgorithmType::ModHash, TCalculationEngineModBase::createLUT(65536, &coreState));
    expectSameKernels(*table.engine, expected);
    EXPECT_EQ(table.engine->getProperties(), "MOD#:0");
}

TEST(TableEngineInitialise, FailsForPointsThatAreNoPowerOfTwo) {
    for (const std::string points : {"12", "3", "65535", "4294967295"}) {
        TableEngine table(points, coreState);
        const Output output = capture([&] { EXPECT_FALSE(table.engine->initialise()); });
        EXPECT_EQ(output.out, "") << points;
        EXPECT_EQ(output.err, pointsLine) << points;
        EXPECT_EQ(table.engine->getProperties(), "MOD#:" + points);
    }
}

TEST(TableEngineInitialise, FailsForAStateFormatWhoseCorrectionsExceedAByte) {
    for (const std::string points : {"", "16", "12"}) {
        for (const TNumberFormat& format :
             {TNumberFormat(12, 5), TNumberFormat(8, 3), TNumberFormat(16, 9)}) {
            TableEngine table(points, format);
            const Output output = capture([&] { EXPECT_FALSE(table.engine->initialise()); });
            EXPECT_EQ(output.out, "") << points;
            EXPECT_EQ(output.err, binaryPointLine) << points;
        }
    }
}

TEST(TableEngineInitialise, LeavesTheEngineAsItWasWhenItFails) {
    ProbeEngine maxLog;
    TableEngine table("12", coreState);
    capture([&] { table.engine->initialise(); });
    expectSameKernels(*table.engine, maxLog);

    TableEngine built("16", coreState);
    ASSERT_TRUE(built.engine->initialise());
    ProbeEngine expected(AlgorithmType::ModHash, TCalculationEngineModBase::createLUT(16, &coreState));
    built.state = TNumberFormat(12, 5);
    capture([&] { EXPECT_FALSE(built.engine->initialise()); });
    expectSameKernels(*built.engine, expected);
}

}  // namespace
}  // namespace quarzel::test
