// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <sstream>

#include "refusal.hpp"
#include "vectors/memory_image.hpp"

namespace quarzel::test {

namespace {

using tool::MemoryImage;
using Kind = tool::MemoryWord::Kind;

MemoryImage read(const std::string& text, std::size_t size = 4) {
    std::istringstream stream(text);
    return tool::readMemoryText(stream, size, "m.hex");
}

/// The words as text: a value in decimal, x, z, or - for a missing one.
std::string wordsOf(const MemoryImage& image) {
    std::string text;
    for (const tool::MemoryWord& word : image.words) {
        text += text.empty() ? "" : " ";
        text += word.kind == Kind::known     ? std::to_string(word.value)
                : word.kind == Kind::x       ? "x"
                : word.kind == Kind::z       ? "z"
                : word.kind == Kind::missing ? "-"
                                             : "?";
    }
    return text;
}

void expectRefused(const std::string& text, const std::string& message) {
    EXPECT_EQ(refusalOf([&] { read(text); }), "quarzel: error: m.hex: line " + message +
                                                  "; write the memory with $writememh, a decision a word\n");
}

}  // namespace

TEST(MemoryText, HoldsWordsBetweenSpaceOfAnyKind) {
    EXPECT_EQ(wordsOf(read("1 0\t1\r\n0\v\f")), "1 0 1 0");
    EXPECT_EQ(wordsOf(read("")), "- - - -");
}

TEST(MemoryText, ReadsDigitsInBothCasesAndUnderscores) {
    EXPECT_EQ(wordsOf(read("fF 00_1 _8 0000000000ffffffff")), "255 1 8 4294967295");
}

TEST(MemoryText, TellsUndefinedFromUndrivenDigits) {
    EXPECT_EQ(wordsOf(read("x 0Z zX ?")), "x z x z");
}

TEST(MemoryText, PutsWordsAtAddresses) {
    EXPECT_EQ(wordsOf(read("@2 1 0 @00 0")), "0 - 1 0");
    EXPECT_EQ(wordsOf(read("1@1 0@0 0")), "0 0 - -") << "the later word counts";
}

TEST(MemoryText, SkipsCommentsOfBothKinds) {
    EXPECT_EQ(wordsOf(read("// 0x00000000\n1//1\n/* 1\n**/0/**/1")), "1 0 1 -");
}

TEST(MemoryText, CountsWhatLiesBeyondWithoutTakingMemory) {
    const MemoryImage image = read("@2 0 1 1 1 @ffffffffffff 1");
    EXPECT_EQ(wordsOf(image), "- - 0 1");
    EXPECT_EQ(image.beyond, 3U);
}

TEST(MemoryText, KnowsTheLineOfAWord) {
    const MemoryImage image = read("1\n\n// one more\n0 /*\n*/ 1");
    EXPECT_EQ(image.words[0].line, 1U);
    EXPECT_EQ(image.words[1].line, 4U);
    EXPECT_EQ(image.words[2].line, 5U);
}

TEST(MemoryText, IsRefusedWhereItIsNotWellFormed) {
    expectRefused("1\n0g", "2: holds 'g', which is not a hexadecimal digit");
    expectRefused("1 / 1", "1: holds a '/' that begins no comment");
    expectRefused("1 /* 1\n", "2: holds a comment that does not end");
    expectRefused("@ 1", "1: holds an '@' without an address");
    expectRefused("@x 1", "1: holds an address that is not a hexadecimal number");
    expectRefused("@12345678123456789 1", "1: holds an address that is not a hexadecimal number");
    expectRefused("123456789", "1: holds a word of more than 32 bits");
}

}  // namespace quarzel::test
