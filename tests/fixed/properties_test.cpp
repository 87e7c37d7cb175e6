// SPDX-License-Identifier: MIT
// How a property string is split into the type and its parameters.
#include "fixed/properties.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

namespace quarzel::test {
namespace {

using testing::Pair;

TEST(SplitString, CutsAtTheFirstDelimiterAndDropsIt) {
    EXPECT_THAT(splitString("Fix_12_3", "_"), Pair("Fix", "12_3"));
    EXPECT_THAT(splitString("MOD#:16", ":"), Pair("MOD#", "16"));
    EXPECT_THAT(splitString("a:b:c", ":"), Pair("a", "b:c"));
    EXPECT_THAT(splitString("a::b", ":"), Pair("a", ":b"));
}

TEST(SplitString, TakesATextWithoutADelimiterWhole) {
    EXPECT_THAT(splitString("MOD", ":"), Pair("MOD", ""));
    EXPECT_THAT(splitString("", ":"), Pair("", ""));
    EXPECT_THAT(splitString("Fix_8_3", ":"), Pair("Fix_8_3", ""));
}

TEST(SplitString, GivesAnEmptySideForADelimiterAtAnEnd) {
    EXPECT_THAT(splitString("MOD:", ":"), Pair("MOD", ""));
    EXPECT_THAT(splitString(":16", ":"), Pair("", "16"));
    EXPECT_THAT(splitString(":", ":"), Pair("", ""));
    EXPECT_THAT(splitString("::", ":"), Pair("", ":"));
}

TEST(SplitString, TakesEveryCharacterOfTheSetForADelimiter) {
    EXPECT_THAT(splitString("Fix_12:3", ":_"), Pair("Fix", "12:3"));
    EXPECT_THAT(splitString("Fix:12_3", ":_"), Pair("Fix", "12_3"));
    EXPECT_THAT(splitString("a:_b", "_:"), Pair("a", "_b"));
    EXPECT_THAT(splitString("a:b", ""), Pair("a:b", ""));
}

TEST(SplitString, StripsNothing) {
    EXPECT_THAT(splitString(" MOD : 16\n", ":"), Pair(" MOD ", " 16\n"));
    EXPECT_THAT(splitString("\t", ":"), Pair("\t", ""));
}

TEST(SplitString, PassesAnyByteThrough) {
    EXPECT_THAT(splitString("\xC3\xBC:\xFF", ":"), Pair("\xC3\xBC", "\xFF"));
    EXPECT_THAT(splitString(std::string("a\0b:c\0d", 7), ":"),
                Pair(std::string("a\0b", 3), std::string("c\0d", 3)));
}

}  // namespace
}  // namespace quarzel::test
