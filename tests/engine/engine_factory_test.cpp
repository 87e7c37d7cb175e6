// SPDX-License-Identifier: MIT
// How an engine is created from its property string, and what it tells before it is initialised.
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "engine/engine.hpp"
#include "engine/engine_mod.hpp"
#include "engine/engine_mod_hash.hpp"
#include "fixed/number_format.hpp"
#include "support/capture.hpp"
#include "support/locale_guard.hpp"

namespace quarzel::test {
namespace {

using Engine = std::unique_ptr<TCalculationEngine>;

/// Create an engine that must be made without a word.
Engine accepted(const std::string& properties) {
    Engine engine;
    const Output output = capture([&] { engine.reset(TCalculationEngine::create(properties)); });
    EXPECT_EQ(output.out + output.err, "") << properties;
    EXPECT_NE(engine, nullptr) << properties;
    return engine;
}

/// What is written about an engine that must be refused.
std::string refusal(const std::string& properties) {
    Engine engine;
    const Output output = capture([&] { engine.reset(TCalculationEngine::create(properties)); });
    EXPECT_EQ(engine, nullptr) << properties;
    EXPECT_EQ(output.out, "") << properties;
    return output.err;
}

TEST(EngineFactory, MakesTheMaxLogEngine) {
    for (const std::string properties : {"MOD", "MOD:"}) {
        const Engine engine = accepted(properties);
        ASSERT_NE(engine, nullptr);
        EXPECT_NE(dynamic_cast<TCalculationEngineMod*>(engine.get()), nullptr);
        EXPECT_EQ(engine->getProperties(), "MOD");
    }
}

TEST(EngineFactory, RefusesParametersOfTheMaxLogEngineAndShowsThem) {
    for (const std::string rest : {"x", "16", "0", " ", ":", "a:b", "MOD"}) {
        EXPECT_EQ(refusal("MOD:" + rest), "ERROR:TCalculationEngineMod:Unexpected properties:" + rest + "\n");
    }
}

TEST(EngineFactory, OffersNoOtherTypeInAnyCase) {
    for (const std::string type :
         {"mod", "Mod", "MOD*", "MOD ", " MOD", "MOD##", "mod#", "MOD#16", "MO", "M", ""}) {
        EXPECT_EQ(refusal(type), "ERROR:TCalculationEngine:Unrecognised type:" + type + "\n");
        EXPECT_EQ(refusal(type + ":16"), "ERROR:TCalculationEngine:Unrecognised type:" + type + "\n");
    }
}

TEST(EngineFactory, MakesTheTableEngineFromItsNumberOfPoints) {
    const std::vector<std::pair<std::string, std::string>> cases = {
        {"MOD#:16", "MOD#:16"},         {"MOD#", "MOD#:0"},         {"MOD#:", "MOD#:0"},
        {"MOD#:0", "MOD#:0"},           {"MOD#:1", "MOD#:1"},       {"MOD#:65536", "MOD#:65536"},
        {"MOD#:12", "MOD#:12"},         {"MOD#:16abc", "MOD#:16"},  {"MOD#:16:4", "MOD#:16"},
        {"MOD#:16.9", "MOD#:16"},       {"MOD#: \t16 ", "MOD#:16"}, {"MOD#:+16", "MOD#:16"},
        {"MOD#:016", "MOD#:16"},        {"MOD#:0x10", "MOD#:0"},    {"MOD#:4294967295", "MOD#:4294967295"},
        {"MOD#:-1", "MOD#:4294967295"},
    };
    for (const auto& [properties, told] : cases) {
        const Engine engine = accepted(properties);
        ASSERT_NE(engine, nullptr);
        EXPECT_NE(dynamic_cast<TCalculationEngineModHash*>(engine.get()), nullptr) << properties;
        EXPECT_EQ(engine->getProperties(), told) << properties;
        const Engine again = accepted(told);
        ASSERT_NE(again, nullptr);
        EXPECT_EQ(again->getProperties(), told);
    }
}

TEST(EngineFactory, RefusesAnUnreadableNumberOfPoints) {
    for (const std::string rest :
         {"abc", " ", ":", ":16", "x16", "#16", "-", "+", ".5", "4294967296", "99999999999999999999"}) {
        EXPECT_EQ(refusal("MOD#:" + rest), "ERROR:TCalculationEngineModHash:Illegal number of points\n")
            << rest;
    }
}

TEST(EngineFactory, ReadsTheNumberOfPointsInAnyLocale) {
    const GroupingLocale grouping;
    const Engine engine = accepted("MOD#:1,6");
    ASSERT_NE(engine, nullptr);
    EXPECT_EQ(engine->getProperties(), "MOD#:1");
}

TEST(EngineFormats, AreUnsetUntilTheyAreHandedOver) {
    for (const std::string properties : {"MOD", "MOD#:16"}) {
        const Engine engine = accepted(properties);
        ASSERT_NE(engine, nullptr);
        EXPECT_EQ(engine->stateFormat(), nullptr);
        EXPECT_EQ(engine->gammaFormat(), nullptr);
        const TNumberFormat input(8, 3);
        const TNumberFormat state(12, 3);
        const TNumberFormat branch(8, 3);
        engine->setFormats(&input, &state, &branch);
        EXPECT_EQ(engine->stateFormat(), &state);
        EXPECT_EQ(engine->gammaFormat(), &branch);
    }
}

}  // namespace
}  // namespace quarzel::test
