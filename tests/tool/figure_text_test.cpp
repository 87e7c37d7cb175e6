// SPDX-License-Identifier: MIT
#include "plot/figure_text.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace quarzel::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using tool::wrapped;

}  // namespace

TEST(FigureText, IsMendedWhereItIsNotWellFormed) {
    EXPECT_EQ(tool::mendedText("\u00d7 'fine'"), "\u00d7 'fine'");
    EXPECT_EQ(tool::mendedText("a\xff\xc3"), "a\uFFFD\uFFFD");
    EXPECT_EQ(tool::mendedText("a\nb\x01\x7f"), "a b  ");
    EXPECT_EQ(tool::mendedText("\xef\xbf\xbf\xef\xbf\xbe"), "\uFFFD\uFFFD");
}

TEST(FigureText, IsCutAtBlanksWhereItCanBe) {
    EXPECT_THAT(wrapped("one two three", 6), ElementsAre("one two", "three"));
    EXPECT_THAT(wrapped("abcdefgh", 2), ElementsAre("abc", "def", "gh"));
    EXPECT_THAT(wrapped("\u00e4\u00e4\u00e4\u00e4", 1.5), ElementsAre("\u00e4\u00e4", "\u00e4\u00e4"));
    EXPECT_THAT(wrapped("W", 0), ElementsAre("W"));
    EXPECT_THAT(wrapped("", 5), IsEmpty());
}

TEST(FigureText, LinesAreNoWiderThanAsked) {
    const std::string text = "K = 6144, max-log, 8-bit words, 6-bit inputs, extrinsics scaled per iteration";
    for (const double width : {3.0, 7.5, 20.0, 33.0}) {
        for (const std::string& line : wrapped(text, width)) {
            EXPECT_LE(tool::widthOf(line), width) << line;
        }
    }
}

TEST(FigureText, MeansNothingToGnuplot) {
    EXPECT_EQ(tool::scriptText("''it's `ls` \"$a\" \\n @b"),
              R"("\047\047it\047s \140ls\140 \042\044a\042 \134n \100b")");
}

}  // namespace quarzel::test
