// SPDX-License-Identifier: MIT
// The algorithm types as text on streams.
#include <gtest/gtest.h>

#include <iterator>
#include <sstream>
#include <string>
#include <vector>

#include "engine/engine_mod_base.hpp"
#include "engine/probe_engine.hpp"

namespace quarzel::test {
namespace {

std::string written(int value) {
    std::ostringstream stream;
    stream << static_cast<AlgorithmType>(value);
    return stream.str();
}

int number(AlgorithmType type) {
    return static_cast<int>(type);
}

/// What a stream still holds, whatever its state.
std::string unread(std::istream& stream) {
    return {std::istreambuf_iterator<char>(stream.rdbuf()), {}};
}

TEST(AlgorithmTypeText, IsWrittenForEachType) {
    EXPECT_EQ(written(1), "MOD");
    EXPECT_EQ(written(2), "MOD*");
    EXPECT_EQ(written(3), "MOD#");
}

TEST(AlgorithmTypeText, IsUnknownForAnyOtherValue) {
    for (const int value : {0, 4, -1, 257, 65537, 2147483647, -2147483647 - 1}) {
        EXPECT_EQ(written(value), "<unknown>") << value;
    }
}

TEST(AlgorithmTypeText, OfAStreamThatHasFailedIsNotRead) {
    std::istringstream stream("MOD");
    stream.setstate(std::ios::failbit);
    AlgorithmType type = AlgorithmType::Mod;
    stream >> type;
    EXPECT_EQ(number(type), 0);
    EXPECT_EQ(unread(stream), "MOD");
}

struct Reading {
    std::string text;
    int value;
    std::string rest;
};

TEST(AlgorithmTypeText, IsReadUpToWhatWasUnderstood) {
    const std::vector<Reading> readings = {
        {"MOD", 1, ""},
        {"mod", 1, ""},
        {"mOd", 1, ""},
        {"MoD", 1, ""},
        {"MOD:16", 1, ":16"},
        {"MOD:", 1, ":"},
        {"MOD 16", 1, " 16"},
        {"MOD\tx", 1, "\tx"},
        {"MOD\n", 1, "\n"},
        {"MOD\x01", 1, "\x01"},
        {std::string("MOD\0x", 5), 1, std::string("\0x", 2)},
        {"MOD*", 2, ""},
        {"mod*", 2, ""},
        {"MOD*:16", 2, ":16"},
        {"MOD**", 2, "*"},
        {"MOD*#", 2, "#"},
        {"MOD#", 3, ""},
        {"Mod#:16", 3, ":16"},
        {"MOD#x", 3, "x"},
        {"MODX", 0, "X"},
        {"MODMOD", 0, "MOD"},
        {"MOD!", 0, "!"},
        {"MOD9", 0, "9"},
        {"MOD;", 0, ";"},
        {"MOD+", 0, "+"},
        {"MOD\x7F", 0, "\x7F"},
        {"MOD\x80", 0, "\x80"},
        {"MOD\xFF", 0, "\xFF"},
        {"MO", 0, ""},
        {"M", 0, ""},
        {"", 0, ""},
        {"MO:", 0, ":"},
        {"MOX", 0, "X"},
        {"MD", 0, "D"},
        {"MMOD", 0, "MOD"},
        {"OD", 0, "OD"},
        {"XMOD", 0, "XMOD"},
        {" MOD", 0, " MOD"},
        {"\nMOD", 0, "\nMOD"},
        {"1", 0, "1"},
        {"<unknown>", 0, "<unknown>"},
    };
    for (const Reading& reading : readings) {
        std::istringstream stream(reading.text);
        auto type = AlgorithmType::ModHash;
        EXPECT_EQ(&(stream >> type), &stream);
        EXPECT_EQ(number(type), reading.value) << reading.text;
        EXPECT_FALSE(stream.fail()) << reading.text;
        EXPECT_EQ(unread(stream), reading.rest) << reading.text;
    }
}

TEST(AlgorithmTypeText, IsReadAsItWasWritten) {
    for (const int value : {1, 2, 3}) {
        std::istringstream stream(written(value));
        AlgorithmType type{};
        stream >> type;
        EXPECT_EQ(number(type), value);
    }
}

TEST(AlgorithmTypeText, IsReadOneAfterTheOther) {
    std::istringstream stream("MOD*MOD#mod*MOD:");
    AlgorithmType types[4] = {};
    stream >> types[0] >> types[1] >> types[2] >> types[3];
    EXPECT_EQ(number(types[0]), 2);
    EXPECT_EQ(number(types[1]), 3);
    EXPECT_EQ(number(types[2]), 2);
    EXPECT_EQ(number(types[3]), 1);
    EXPECT_EQ(unread(stream), ":");
}

TEST(AlgorithmTypeText, IsNotReadFromAStreamThatHasFailedOrEnded) {
    for (const std::ios_base::iostate state :
         {std::ios_base::failbit, std::ios_base::badbit, std::ios_base::eofbit}) {
        std::istringstream stream("MOD*");
        stream.setstate(state);
        auto type = AlgorithmType::ModHash;
        stream >> type;
        EXPECT_EQ(number(type), 0);
        EXPECT_EQ(stream.rdstate(), state);
        EXPECT_EQ(unread(stream), "MOD*");
    }
}

}  // namespace
}  // namespace quarzel::test
