// SPDX-License-Identifier: MIT
// What the factories of all component families have in common.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "decoder/decoder.hpp"
#include "engine/engine.hpp"
#include "fixed/number_format.hpp"
#include "interleaver/interleaver.hpp"
#include "support/capture.hpp"

namespace quarzel::test {
namespace {

using testing::ElementsAre;

template <class Family>
struct Traits;

template <>
struct Traits<TInterleaver> {
    static constexpr const char* className = "TInterleaver";
    static constexpr const char* listedName = "3GPPLTE";
    static std::vector<std::string> usedByTheModel() { return {"3GPPLTE"}; }
};

template <>
struct Traits<TCalculationEngine> {
    static constexpr const char* className = "TCalculationEngine";
    static constexpr const char* listedName = "MOD";
    static std::vector<std::string> usedByTheModel() { return {"MOD", "MOD#:16"}; }
};

template <>
struct Traits<TDecoder> {
    static constexpr const char* className = "TDecoder";
    static constexpr const char* listedName = "3GPPPU";
    static std::vector<std::string> usedByTheModel() { return {"3GPPPU:2", "3GPPPU:4", "3GPPPU:8"}; }
};

template <class Family>
class ComponentFactory : public testing::Test {};

using Families = testing::Types<TInterleaver, TCalculationEngine, TDecoder>;
TYPED_TEST_SUITE(ComponentFactory, Families);

TYPED_TEST(ComponentFactory, ListsItsOneNameAfreshAtEachCall) {
    std::vector<std::string> first = TypeParam::getNames();
    EXPECT_THAT(first, ElementsAre(Traits<TypeParam>::listedName));
    first.front() = "changed";
    first.emplace_back("grown");
    EXPECT_THAT(TypeParam::getNames(), ElementsAre(Traits<TypeParam>::listedName));
}

TYPED_TEST(ComponentFactory, MakesComponentsThatTellTheirOwnPropertyString) {
    for (const std::string& properties : Traits<TypeParam>::usedByTheModel()) {
        std::unique_ptr<TypeParam> component;
        const Output output = capture([&] { component.reset(TypeParam::create(properties)); });
        EXPECT_EQ(output.out + output.err, "") << properties;
        ASSERT_NE(component, nullptr) << properties;
        EXPECT_EQ(component->getProperties(), properties);
    }
}

TYPED_TEST(ComponentFactory, MakesANewComponentAtEachCall) {
    const std::string name = Traits<TypeParam>::listedName;
    const std::unique_ptr<TypeParam> first(TypeParam::create(name));
    const std::unique_ptr<TypeParam> second(TypeParam::create(name));
    ASSERT_NE(first, nullptr);
    ASSERT_NE(second, nullptr);
    EXPECT_NE(first, second);
}

TYPED_TEST(ComponentFactory, NamesTheHeadOfAnyOtherTypeAndRefusesIt) {
    const std::string name = Traits<TypeParam>::listedName;
    const std::vector<std::string> unknown = {
        "",     name + " ", " " + name, name + "x", name.substr(1), name.substr(0, name.size() - 1),
        "mod",  "MOD*",     "MOD##",    "3gppLTE",  "3gpppu",       "LTE",
        "3GPP", "3GPP2",    "3GPP2PU",  "Fix_8_3",  "\xFFx"};
    for (const std::string& head : unknown) {
        for (const std::string rest : {"", ":", ":2", ":a:b", ":\n"}) {
            TypeParam* component = nullptr;
            const Output output = capture([&] { component = TypeParam::create(head + rest); });
            EXPECT_EQ(component, nullptr) << head << rest;
            EXPECT_EQ(output.out, "") << head << rest;
            EXPECT_EQ(output.err, std::string("ERROR:") + Traits<TypeParam>::className +
                                      ":Unrecognised type:" + head + "\n");
        }
    }
}

TEST(DecoderFactory, GivesADecoderWithoutParametersItsDefaults) {
    for (const std::string properties : {"3GPPPU", "3GPPPU:"}) {
        std::unique_ptr<TDecoder> decoder;
        const Output output = capture([&] { decoder.reset(TDecoder::create(properties)); });
        EXPECT_EQ(output.out + output.err, "") << properties;
        ASSERT_NE(decoder, nullptr) << properties;
        EXPECT_EQ(decoder->getProperties(), "3GPPPU:4");
    }
}

TEST(NumberFormatFactory, MakesANewFormatAtEachCall) {
    const std::unique_ptr<TNumberFormat> first(TNumberFormat::create("Fix_12_3"));
    const std::unique_ptr<TNumberFormat> second(TNumberFormat::create("Fix_12_3"));
    ASSERT_NE(first, nullptr);
    ASSERT_NE(second, nullptr);
    EXPECT_NE(first, second);
}

}  // namespace
}  // namespace quarzel::test
