// SPDX-License-Identifier: MIT
#include "junit_report.hpp"

#include <gtest/gtest.h>

#include <cstdlib>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// Whether xmllint finds a file well-formed and as the schema says.
bool isValid(const std::string& file) {
    const std::string command =
        "xmllint --noout --schema " QUARZEL_TEST_DATA "/junit.xsd '" + file + "' 2>'" + file + ".log'";
    return std::system(command.c_str()) == 0;
}

/// What xmllint reads at a place of a file.
std::string valueAt(const std::string& file, const std::string& place) {
    const std::string command =
        "xmllint --xpath 'string(" + place + ")' '" + file + "' >'" + file + ".value' 2>&1";
    EXPECT_EQ(std::system(command.c_str()), 0) << readFile(file + ".value");
    std::string value = readFile(file + ".value");
    value.pop_back();  // the line end after it
    return value;
}

}  // namespace

TEST(JunitReport, IsWhatTheSchemaAsksFor) {
    const TemporaryDirectory directory;
    const std::string text = tool::junitText(
        "suite",
        {{"class", "first", {}}, {"class", "second", tool::JunitCase::Failure{"message", "details"}}});
    EXPECT_EQ(text,
              "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
              "<testsuites name=\"suite\" tests=\"2\" failures=\"1\" errors=\"0\">\n"
              " <testsuite name=\"suite\" tests=\"2\" failures=\"1\" errors=\"0\" skipped=\"0\">\n"
              "  <testcase classname=\"class\" name=\"first\"/>\n"
              "  <testcase classname=\"class\" name=\"second\">\n"
              "   <failure message=\"message\" type=\"difference\">details</failure>\n"
              "  </testcase>\n"
              " </testsuite>\n"
              "</testsuites>\n");
    EXPECT_TRUE(isValid(directory.write("report.xml", text)));
    EXPECT_FALSE(isValid(directory.write("bad.xml", "<testsuites><testcase/></testsuites>\n")));
}

TEST(JunitReport, KeepsAnyTextThroughXml) {
    const TemporaryDirectory directory;
    const std::string nasty = "<a href=\"x\">&amp;'\t\r\n]]>\xc3\xa4 b";
    const std::string file = directory.write(
        "report.xml", tool::junitText(nasty, {{nasty, nasty, tool::JunitCase::Failure{nasty, nasty}}}));
    EXPECT_TRUE(isValid(file)) << readFile(file + ".log");
    for (const char* const place : {"//testsuite/@name", "//testcase/@classname", "//testcase/@name",
                                    "//failure/@message", "//failure"}) {
        EXPECT_EQ(valueAt(file, place), nasty) << place;
    }
}

TEST(JunitReport, ReplacesWhatXmlCannotHold) {
    const TemporaryDirectory directory;
    const std::string file = directory.write(
        "report.xml",
        tool::junitText("s",
                        {{"c", std::string("a\x01\x1b") + '\0' + "\xff\xef\xbf\xbf\xef\xbf\xbe z", {}}}));
    EXPECT_TRUE(isValid(file)) << readFile(file + ".log");
    const std::string replaced = "\xef\xbf\xbd";
    EXPECT_EQ(valueAt(file, "//testcase/@name"),
              "a" + replaced + replaced + replaced + replaced + replaced + replaced + " z");
}

TEST(JunitReport, OfCompareHasATestForEachBlock) {
    const TemporaryDirectory directory;
    const std::string set = directory.path("a&b <set>");
    ASSERT_EQ(runTool({"vectors", set, "--blocks", "2"}).exitCode, 0);
    std::string words;
    const std::string memory = readFile(set + "/u2_a1/dout.hex");
    const std::string right = directory.write("right.hex", memory);
    const std::string report = directory.path("report.xml");
    ASSERT_EQ(runTool({"compare", set, right, "--junit", report}).exitCode, 0);
    EXPECT_TRUE(isValid(report)) << readFile(report + ".log");
    EXPECT_EQ(valueAt(report, "//testsuite/@tests"), "2");
    EXPECT_EQ(valueAt(report, "//testsuite/@failures"), "0");

    const std::string wrong = directory.write("wrong.hex", memory.substr(0, memory.size() - 2) + "x\n0\n");
    const ToolRun run = runTool({"compare", set, wrong, "--junit", report});
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_TRUE(isValid(report)) << readFile(report + ".log");
    EXPECT_EQ(valueAt(report, "//testsuite/@failures"), "2");
    EXPECT_EQ(valueAt(report, "//testcase[2]/@classname"), set + "/u2_a1");
    EXPECT_EQ(valueAt(report, "//testcase[2]/@name"), "block 1 (K = 40, 6 iterations, noise)");
    const std::string last = memory.substr(memory.size() - 2, 1);
    EXPECT_EQ(valueAt(report, "//testcase[2]/failure/@message"),
              "1 of 40 bits differ; bit 39 (from 0) is x, undefined, expected " + last);
    EXPECT_EQ(valueAt(report, "//testcase[2]/failure"),
              "The model's trace of this block:\nquarzel decode '" + set +
                  "/u2_a1/npy/k40_i6.soft.npy' --units 2 --algorithm 1 --iterations 6 --trace 12 "
                  "--trace-block 1");
    EXPECT_EQ(valueAt(report, "//testcase[3]/failure/@message"), "1 word after the last decision expected");
}

TEST(JunitReport, OfTraceDiffHasOneTest) {
    const TemporaryDirectory directory;
    const std::string trace = directory.path("a.txt");
    const std::string capture = QUARZEL_CAPTURES "/k40.soft.npy";
    ASSERT_EQ(runTool({"decode", capture, "--trace", "1", "--trace-file", trace}).exitCode, 0);
    const std::string report = directory.path("report.xml");
    ASSERT_EQ(runTool({"trace-diff", trace, trace, "--junit", report}).exitCode, 0);
    EXPECT_TRUE(isValid(report)) << readFile(report + ".log");
    EXPECT_EQ(valueAt(report, "//testcase/@name"), "equals " + trace);
    EXPECT_EQ(valueAt(report, "//testsuite/@failures"), "0");

    const std::string other = directory.path("b.txt");
    ASSERT_EQ(
        runTool({"decode", capture, "--trace", "1", "--trace-block", "1", "--trace-file", other}).exitCode,
        0);
    const ToolRun run = runTool({"trace-diff", trace, other, "--junit", report});
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_TRUE(isValid(report)) << readFile(report + ".log");
    EXPECT_EQ(valueAt(report, "//failure/@message"), "the traces differ");
    EXPECT_EQ(valueAt(report, "//failure"), run.out);
}

TEST(JunitReport, IsNotWrittenWhenThereIsAnError) {
    const TemporaryDirectory directory;
    const std::string expected = directory.path("expected.npy");
    xt::dump_npy(expected, xt::xarray<std::uint8_t>{{1, 2, 3, 4, 5}});
    const std::string actual = directory.write("sim.hex", "no");
    const auto refusal = [&](const std::string& file) {
        return runTool({"compare", expected, actual, "--junit", file});
    };
    EXPECT_EQ(refusal(directory.path("report.xml")).exitCode, 3);
    EXPECT_EQ(directory.names(), (std::vector<std::string>{"expected.npy", "sim.hex"}));
    EXPECT_EQ(refusal(actual).err,
              "quarzel: error: --junit: " + actual + " is also read; give another name\n");
    EXPECT_EQ(refusal(actual).exitCode, 2);
    EXPECT_EQ(refusal("-").err, "quarzel: error: --junit: the report needs a file of its own; name one\n");
    EXPECT_EQ(refusal(directory.path("no/report.xml")).exitCode, 3);
    EXPECT_EQ(readFile(actual), "no");
}

}  // namespace quarzel::test
