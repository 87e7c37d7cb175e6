// SPDX-License-Identifier: MIT
#include "fixed/string_utilities.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <vector>

namespace quarzel::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// A text that may hold zero bytes, from a literal.
template <std::size_t size>
std::string bytes(const char (&literal)[size]) {
    return {literal, size - 1};
}

TEST(StripWs, DropsWhiteSpaceAtTheEndsAndLeavesOneBlankForEachRunInside) {
    EXPECT_EQ(stripws("  a \t b  "), "a b");
    EXPECT_EQ(stripws("a b"), "a b");
    EXPECT_EQ(stripws("\r\n\v\fa\r\nb\v\fc\r\n"), "a b c");
    EXPECT_EQ(stripws("abc"), "abc");
}

TEST(StripWs, LeavesNothingOfWhiteSpaceAlone) {
    EXPECT_EQ(stripws(""), "");
    EXPECT_EQ(stripws(" "), "");
    EXPECT_EQ(stripws(" \t\r\n "), "");
}

TEST(StripWs, TakesEveryCodeBelow33AndFrom128OnAsWhiteSpace) {
    for (int code = SCHAR_MIN; code <= SCHAR_MAX; ++code) {
        const auto c = static_cast<char>(code);
        const std::string text = std::string("a") + c + c + "b";
        EXPECT_EQ(stripws(text), code < 33 ? "a b" : text) << "code " << code;
    }
}

TEST(StripWs, WorksOnLongTexts) {
    const std::string blanks(1000000, ' ');
    EXPECT_EQ(stripws(blanks + "a" + blanks + "b" + blanks), "a b");
    const std::string letters(1000000, 'x');
    EXPECT_EQ(stripws(letters), letters);
}

TEST(StringTok, DropsSeparatorsAndKeepsTheOthersAsTokens) {
    EXPECT_THAT(stringtok("a + b*c", " ", "+*"), ElementsAre("a", "+", "b", "*", "c"));
    EXPECT_THAT(stringtok("key=value", "", "="), ElementsAre("key", "=", "value"));
    EXPECT_THAT(stringtok("one,two;three", ",;", ""), ElementsAre("one", "two", "three"));
}

TEST(StringTok, MakesNoEmptyTokens) {
    EXPECT_THAT(stringtok("", " ", "+"), IsEmpty());
    EXPECT_THAT(stringtok("   ", " ", "+"), IsEmpty());
    EXPECT_THAT(stringtok(",,a,,b,,", ",", ""), ElementsAre("a", "b"));
}

TEST(StringTok, KeepsNeighbouringTokenCharactersApart) {
    EXPECT_THAT(stringtok("++", "", "+"), ElementsAre("+", "+"));
    EXPECT_THAT(stringtok("+a-", "", "+-"), ElementsAre("+", "a", "-"));
}

TEST(StringTok, KeepsACharacterOfBothSets) {
    EXPECT_THAT(stringtok("a:b", ":", ":"), ElementsAre("a", ":", "b"));
}

TEST(StringTok, WithEmptySetsTakesTheTextAsOneToken) {
    EXPECT_THAT(stringtok("a b:c", "", ""), ElementsAre("a b:c"));
}

TEST(StringTok, TakesZeroAndHighBytesAsAnyOthers) {
    EXPECT_THAT(stringtok(bytes("a\0b\xFF"
                                "c"),
                          bytes("\0"), "\xFF"),
                ElementsAre("a", "b", "\xFF", "c"));
    EXPECT_THAT(stringtok(bytes("a\0b"), ",", ""), ElementsAre(bytes("a\0b")));
}

TEST(StringTok, WorksOnLongTexts) {
    std::string text;
    for (int i = 0; i < 100000; ++i) {
        text += "ab ";
    }
    EXPECT_THAT(stringtok(text, " ", ""), testing::AllOf(testing::SizeIs(100000), testing::Each("ab")));
}

TEST(ToFilename, ReplacesAwkwardCharacters) {
    EXPECT_EQ(toFilename("<>,-%+=."), "[]cmpped");
    EXPECT_EQ(toFilename("snr=-1.5 dB, 50%"), "snrem1d5_dBc_50p");
    EXPECT_EQ(toFilename(""), "");
}

TEST(ToFilename, MakesAnUnderscoreOfEveryCodeBelow33AndFrom128On) {
    for (int code = SCHAR_MIN; code < 33; ++code) {
        EXPECT_EQ(toFilename(std::string(2, static_cast<char>(code))), "__") << "code " << code;
    }
}

TEST(ToFilename, LeavesAllOtherCharacters) {
    const std::string replaced = "<>,-%+=.";
    for (int code = 33; code <= SCHAR_MAX; ++code) {
        const std::string text(1, static_cast<char>(code));
        if (replaced.find(text) == std::string::npos) {
            EXPECT_EQ(toFilename(text), text) << "code " << code;
        }
    }
}

TEST(ExpandTabs, FillsUpToTheNextPosition) {
    const std::vector<unsigned> positions = {4, 8, 20};
    EXPECT_EQ(expandTabs("\ta", positions), "    a");
    EXPECT_EQ(expandTabs("abc\td", positions), "abc d");
    EXPECT_EQ(expandTabs("abcd\te", positions), "abcd    e");
    EXPECT_EQ(expandTabs("abcde\tf", positions), "abcde   f");
    EXPECT_EQ(expandTabs("\t\t\tx", positions), "                    x");
    EXPECT_EQ(expandTabs("a\tb\tc\td", positions), "a   b   c           d");
}

TEST(ExpandTabs, PutsOneBlankPastTheLastPosition) {
    EXPECT_EQ(expandTabs("abcd\te\t\tf", {4}), "abcd e  f");
    EXPECT_EQ(expandTabs("a\tb", {}), "a b");
    EXPECT_EQ(expandTabs("\ta", {0}), " a");
}

TEST(ExpandTabs, BeginsAgainAtColumn0AfterALineFeed) {
    EXPECT_EQ(expandTabs("ab\tc\nd\te\n\tf", {4}), "ab  c\nd   e\n    f");
}

TEST(ExpandTabs, LeavesATextWithoutTabs) {
    EXPECT_EQ(expandTabs("", {4}), "");
    EXPECT_EQ(expandTabs(bytes("a b\0\xC3\r"), {4}), bytes("a b\0\xC3\r"));
}

TEST(ExpandTabs, CountsEachByteAsAColumn) {
    EXPECT_EQ(expandTabs(bytes("\0\xFF\tx"), {4}), bytes("\0\xFF  x"));
}

TEST(NocaseCompare, SeesNoCaseInTheLettersAToZ) {
    EXPECT_TRUE(nocase_compare("Fix_12_3", "fIX_12_3"));
    EXPECT_TRUE(nocase_compare("abcdefghijklmnopqrstuvwxyz", "ABCDEFGHIJKLMNOPQRSTUVWXYZ"));
    EXPECT_TRUE(nocase_compare("", ""));
    EXPECT_FALSE(nocase_compare("abc", "abd"));
}

TEST(NocaseCompare, TellsLengthsApart) {
    EXPECT_FALSE(nocase_compare("abc", "ab"));
    EXPECT_FALSE(nocase_compare("ab", "abc"));
    EXPECT_FALSE(nocase_compare("", "a"));
    EXPECT_FALSE(nocase_compare("ab", bytes("ab\0")));
}

TEST(NocaseCompare, ComparesWhatFollowsAZeroByte) {
    EXPECT_TRUE(nocase_compare(bytes("a\0b"), bytes("A\0B")));
    EXPECT_FALSE(nocase_compare(bytes("a\0b"), bytes("a\0c")));
}

TEST(NocaseCompare, HoldsForTwoCharactersOnlyIfEqualOrTheTwoCasesOfALetter) {
    for (int x = CHAR_MIN; x <= CHAR_MAX; ++x) {
        for (int y = CHAR_MIN; y <= CHAR_MAX; ++y) {
            const bool isLetterPair = (x >= 'a' && x <= 'z' && y == x - 32) ||  //
                                      (y >= 'a' && y <= 'z' && x == y - 32);
            EXPECT_EQ(nocase_compare(static_cast<char>(x), static_cast<char>(y)), x == y || isLetterPair)
                << x << " and " << y;
        }
    }
}

}  // namespace
}  // namespace quarzel::test
