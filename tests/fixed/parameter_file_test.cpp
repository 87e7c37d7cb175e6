// SPDX-License-Identifier: MIT
#include "fixed/parameter_file.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>

#include "support/capture.hpp"
#include "support/locale_guard.hpp"

namespace quarzel::test {
namespace {

using Parameters = std::map<std::string, std::string>;
using testing::IsEmpty;

/// What came of reading parameter lines.
struct Reading {
    bool good = false;
    Parameters parameters;
    std::string err;
};

Reading read(const std::string& text, bool addKeys, const Parameters& before = {}) {
    Reading reading;
    reading.parameters = before;
    std::istringstream stream(text);
    const Output output = capture([&] { reading.good = parse(stream, reading.parameters, addKeys); });
    EXPECT_EQ(output.out, "");
    reading.err = output.err;
    return reading;
}

/// The parameters of a text that must be read without a word.
Parameters readAll(const std::string& text) {
    const Reading reading = read(text, true);
    EXPECT_TRUE(reading.good);
    EXPECT_EQ(reading.err, "");
    return reading.parameters;
}

/// A file of a test's own, removed at its end.
class TemporaryFile {
  public:
    explicit TemporaryFile(const std::string& content)
        : itsPath(testing::TempDir() + testing::UnitTest::GetInstance()->current_test_info()->name() +
                  std::to_string(getpid())) {
        std::ofstream(itsPath, std::ios::binary) << content;
    }
    ~TemporaryFile() { std::filesystem::remove(itsPath); }
    TemporaryFile(const TemporaryFile&) = delete;
    TemporaryFile& operator=(const TemporaryFile&) = delete;

    const std::string& path() const { return itsPath; }

  private:
    std::string itsPath;
};

TEST(ParameterFile, GivesKeysAndValuesWithNormalisedWhiteSpace) {
    EXPECT_EQ(readAll("size = 40\n\t block \t size=  6144 \t bits \nname=x\n"),
              (Parameters{{"size", "40"}, {"block size", "6144 bits"}, {"name", "x"}}));
}

TEST(ParameterFile, SplitsAtTheFirstEqualsSign) {
    EXPECT_EQ(readAll("a = b = c\nd==\n"), (Parameters{{"a", "b = c"}, {"d", "="}}));
}

TEST(ParameterFile, AllowsAnEmptyKeyAndAnEmptyValue) {
    EXPECT_EQ(readAll(" = 1\na =\n"), (Parameters{{"", "1"}, {"a", ""}}));
}

TEST(ParameterFile, CutsALineAtItsFirstCommentMark) {
    EXPECT_EQ(readAll("a = 1 # one // and more\n"
                      "b = 2 // two # and more\n"
                      "# c = 3\n"
                      "// d = 4\n"
                      "e # = 5\n"
                      "f = x/y\n"
                      "g = x///y\n"),
              (Parameters{{"a", "1"}, {"b", "2"}, {"f", "x/y"}, {"g", "x"}}));
}

TEST(ParameterFile, SkipsLinesWithoutAnEqualsSign) {
    EXPECT_THAT(readAll("\n   \n\t\x01\x1F\nno value here\n#\n//\n"), IsEmpty());
}

TEST(ParameterFile, LetsTheLastOfSeveralLinesWithAKeyCount) {
    EXPECT_EQ(readAll("a = 1\na = 2\n"), (Parameters{{"a", "2"}}));
}

TEST(ParameterFile, TakesCarriageReturnsAsWhiteSpace) {
    EXPECT_EQ(readAll("a = 1\r\n\r\nb = 2\r\n"), (Parameters{{"a", "1"}, {"b", "2"}}));
}

TEST(ParameterFile, ReadsALastLineWithoutALineFeed) {
    EXPECT_EQ(readAll("a = 1\nb = 2"), (Parameters{{"a", "1"}, {"b", "2"}}));
}

TEST(ParameterFile, TakesZeroAndHighBytesAsWhiteSpace) {
    EXPECT_EQ(readAll(std::string("\0a\0b = \xC3\xA4 1 \xFF\n", 15)), (Parameters{{"a b", "1"}}));
}

TEST(ParameterFile, ReadsVeryLongLines) {
    const std::string key(1000000, 'k');
    const std::string value(1000000, 'v');
    EXPECT_EQ(readAll(key + std::string(1000000, ' ') + "=" + value + "\n"), (Parameters{{key, value}}));
}

TEST(ParameterFile, AddsToAMapAndReplacesItsValuesIfKeysMayBeAdded) {
    const Reading reading = read("b = 2\nc = 3\n", true, {{"a", "old"}, {"b", "old"}});
    EXPECT_TRUE(reading.good);
    EXPECT_EQ(reading.parameters, (Parameters{{"a", "old"}, {"b", "2"}, {"c", "3"}}));
}

TEST(ParameterFile, ReplacesTheValuesOfKnownKeys) {
    const Reading reading = read("b = 2\n", false, {{"a", "old"}, {"b", "old"}});
    EXPECT_TRUE(reading.good);
    EXPECT_EQ(reading.err, "");
    EXPECT_EQ(reading.parameters, (Parameters{{"a", "old"}, {"b", "2"}}));
}

TEST(ParameterFile, ReportsUnknownKeysWithTheirLineAndReadsOn) {
    const Reading reading = read("a = 1\n\n# comment\nfoo = 1\nno value\nbar  baz = 2\nb = 3\n = 4", false,
                                 {{"a", ""}, {"b", ""}});
    EXPECT_FALSE(reading.good);
    EXPECT_EQ(reading.err,
              "ERROR:4:Parameter name 'foo' is invalid\n"
              "ERROR:6:Parameter name 'bar baz' is invalid\n"
              "ERROR:8:Parameter name '' is invalid\n");
    EXPECT_EQ(reading.parameters, (Parameters{{"a", "1"}, {"b", "3"}}));
}

TEST(ParameterFile, TakesKeysThatDifferInCaseAsDifferent) {
    EXPECT_EQ(read("A = 1\n", false, {{"a", ""}}).err, "ERROR:1:Parameter name 'A' is invalid\n");
}

TEST(ParameterFile, WritesLineNumbersWithoutTheGroupsOfTheGlobalLocale) {
    const GroupingLocale grouping;
    EXPECT_EQ(read(std::string(1233, '\n') + "foo = 1\n", false).err,
              "ERROR:1234:Parameter name 'foo' is invalid\n");
}

TEST(ParameterFile, ReadsNothingFromAnEmptyStream) {
    const Reading reading = read("", false, {{"a", "old"}});
    EXPECT_TRUE(reading.good);
    EXPECT_EQ(reading.err, "");
    EXPECT_EQ(reading.parameters, (Parameters{{"a", "old"}}));
}

TEST(ParameterFile, ReadsNothingFromAStreamAtItsEnd) {
    std::istringstream stream("a");
    stream.get();
    stream.peek();
    ASSERT_EQ(stream.rdstate(), std::ios::eofbit);
    Parameters parameters;
    EXPECT_TRUE(parse(stream, parameters, false));
    EXPECT_THAT(parameters, IsEmpty());
    EXPECT_EQ(stream.rdstate(), std::ios::eofbit);
}

TEST(ParameterFile, LeavesItsStreamAtItsEndAndNotFailed) {
    for (const std::string text : {"", "\n", "\n\n", "a = 1", "a = 1\n", "a = 1\nb", "a = 1\n\n", "# c"}) {
        std::istringstream stream(text);
        stream.exceptions(std::ios::failbit | std::ios::badbit);
        Parameters parameters;
        EXPECT_TRUE(parse(stream, parameters, true)) << text;
        EXPECT_EQ(stream.rdstate(), std::ios::eofbit) << text;
    }
}

TEST(ParameterFile, ReadsNothingFromAStreamThatHasFailed) {
    std::istringstream stream("a = 1\n");
    stream.setstate(std::ios::failbit);
    Parameters parameters;
    EXPECT_TRUE(parse(stream, parameters, true));
    EXPECT_THAT(parameters, IsEmpty());
    EXPECT_EQ(stream.rdstate(), std::ios::failbit);
}

TEST(ParameterFile, BeginsWhereTheStreamStands) {
    std::istringstream stream("a = 1\nb = 2\n");
    std::string first;
    std::getline(stream, first);
    Parameters parameters;
    const Output output = capture([&] { EXPECT_FALSE(parse(stream, parameters, false)); });
    EXPECT_EQ(output.err, "ERROR:1:Parameter name 'b' is invalid\n");
}

TEST(ParameterFile, IsReadByItsName) {
    const TemporaryFile file("a = 1\nfoo = 2\nb = 3");
    Parameters parameters = {{"a", ""}, {"b", ""}};
    bool good = true;
    const Output output = capture([&] { good = parse(file.path(), parameters, false); });
    EXPECT_FALSE(good);
    EXPECT_EQ(output.out, "");
    EXPECT_EQ(output.err, "ERROR:2:Parameter name 'foo' is invalid\n");
    EXPECT_EQ(parameters, (Parameters{{"a", "1"}, {"b", "3"}}));

    EXPECT_TRUE(parse(file.path(), parameters, true));
    EXPECT_EQ(parameters, (Parameters{{"a", "1"}, {"b", "3"}, {"foo", "2"}}));
}

TEST(ParameterFile, MayBeEmpty) {
    const TemporaryFile file("");
    Parameters parameters = {{"a", "old"}};
    bool good = false;
    const Output output = capture([&] { good = parse(file.path(), parameters, false); });
    EXPECT_TRUE(good);
    EXPECT_EQ(output.out + output.err, "");
    EXPECT_EQ(parameters, (Parameters{{"a", "old"}}));
}

/// Expect that a name cannot be opened.
void expectNoFile(const std::string& name) {
    Parameters parameters = {{"a", "old"}};
    bool good = true;
    const Output output = capture([&] { good = parse(name, parameters, true); });
    EXPECT_FALSE(good);
    EXPECT_EQ(output.out, "");
    EXPECT_EQ(output.err, "ERROR:Could not open input file '" + name + "'\n");
    EXPECT_EQ(parameters, (Parameters{{"a", "old"}}));
}

TEST(ParameterFile, IsReportedIfItCannotBeOpened) {
    expectNoFile("no such folder/no such file");
    expectNoFile("");
}

TEST(ParameterFile, IsReportedIfItIsADirectory) {
    expectNoFile(testing::TempDir());
    expectNoFile(".");
}

}  // namespace
}  // namespace quarzel::test
