// SPDX-License-Identifier: MIT
#include "trace/trace_text_reader.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "refusal.hpp"
#include "trace/trace_signals.hpp"
#include "trace_cases.hpp"

namespace quarzel::test {

namespace {

/// Read a trace to its end.
/// @return the number of its values
std::size_t readAll(const std::string& text) {
    std::istringstream stream(text);
    const auto reader = tool::makeTraceReader(stream, "trace.txt", std::nullopt);
    std::size_t values = 0;
    tool::TraceRow row;
    while (reader->next(row)) {
        values += row.values.size();
    }
    return values;
}

void expectRefused(const std::string& text, const std::string& problem) {
    EXPECT_EQ(refusalOf([&] { readAll(text); }), "quarzel: error: trace.txt: " + problem + '\n');
}

}  // namespace

TEST(TraceTextReader, TellsWhichLineItCouldNotRead) {
    const std::string png = "\x89PNG\r\n\x1a\n\0\0\0\rIHDR";
    const std::string expected =
        "; expected a trace: a line of dashes, a CSV header, a JSON object or an npy header";
    const std::vector<std::pair<std::string, std::string>> foreign = {
        {"", "is empty" + expected},
        {"\n \n", "ends before line 3" + expected},
        {png, "line 1 is '?PNG'" + expected},
        {std::string("\x7f"
                     "ELF\0",
                     5),
         "line 1 is cut short after '?ELF?'" + expected},
        {"systematic,parity1,parity2\n1,2,3\n", "line 1 is 'systematic,parity1,parity2'" + expected},
        {std::string(1 << 20, '-'), "line 1 is longer than 65535 characters" + expected},
        {std::string(1 << 20, '\0') + '\n', "line 1 is longer than 65535 characters" + expected},
        {"----\n1 2 3\n", "line 2 is '1 2 3'; expected decode=N siso=N or itsSys [0]=[...]"},
    };
    for (const auto& [content, problem] : foreign) {
        expectRefused(content, problem);
    }
}

TEST(TraceTextReader, TellsWhatIsWrongWithALine) {
    const std::vector<std::string> lines = linesOf(smallTraceCase().text);
    const std::string& row = lines[15];
    const std::vector<std::tuple<std::size_t, std::string, std::string>> faults = {
        {2, "itsPar0[1]=[0 16]", "is 'itsPar0[1]=[0 16]'; expected itsPar0[0]=[...]"},
        {1, "itsSys [0]=[0 16 32 48", "is 'itsSys [0]=[0 16 32 48'; expected itsSys [0]=[...]"},
        {1, "itsSys [0]=[]", "is a stream of 0 values; expected 3 values or more"},
        {2, "itsPar0[0]=[0 16]", "is a stream of 2 values; expected 43, as many as in line 2"},
        {1, "itsSys [0]=[0 8 16]", ", position 1 is '8'; expected a multiple of 16 from -32768 to 32752"},
        {1, "itsSys [0]=[0 1.5 16]", ", position 1 is '1.5'; expected a multiple of 16 from -32768 to 32752"},
        {1, "itsSys [0]=[0 32768]",
         ", position 1 is '32768'; expected a multiple of 16 from -32768 to 32752"},
        {7, "itsSys [0]=[0 16 32]", "is 'itsSys [0]=[0 16 32]'; expected a line of dashes"},
        {8, "decode=x siso=0", "is 'decode=x siso=0'; expected decode=N siso=N"},
        {8, "decode=0 siso=-1", "is 'decode=0 siso=-1'; expected decode=N siso=N"},
        {8, "decode=0 siso=0 x", "is 'decode=0 siso=0 x'; expected decode=N siso=N"},
        {9, "n int a8",
         "is 'n int a8'; expected the heading of the columns, 'n int a0 ... ext' or some of them"},
        {9, "n", "is 'n'; expected the heading of the columns, 'n int a0 ... ext' or some of them"},
        {9, "n int code1_sys",
         "is 'n int code1_sys'; expected the heading of the columns, 'n int a0 ... ext' or some of them"},
        {10, "", "is ''; expected a step and its values"},
        {15, "y", "is 'y'; expected a step and 23 values"},
        {15, "5x", "is '5x'; expected a step and 23 values"},
        {15, "5 +0.5 -1", "is a row that ends before column a1; expected a step and 23 values"},
        {15, row + " 0", "is a row with more columns than ext; expected a step and 23 values"},
        {15, "5 +0.5 0.1", ", column a0 is '0.1'; expected a multiple of 0.125 from -256 to 255.875, x or z"},
        {15, "5 +0.5 256", ", column a0 is '256'; expected a multiple of 0.125 from -256 to 255.875, x or z"},
        {15, "5 -256.125",
         ", column int is '-256.125'; expected a multiple of 0.125 from -256 to 255.875, x or z"},
        {15, "5 +-1", ", column int is '+-1'; expected a multiple of 0.125 from -256 to 255.875, x or z"},
        {15, "5 nan", ", column int is 'nan'; expected a multiple of 0.125 from -256 to 255.875, x or z"},
        {15, "5 inf", ", column int is 'inf'; expected a multiple of 0.125 from -256 to 255.875, x or z"},
        {15, "5 1,5", ", column int is '1,5'; expected a multiple of 0.125 from -256 to 255.875, x or z"},
        {53, "decode=0 siso=1", "is 'decode=0 siso=1'; expected a step and 23 values"},
        {54, "siso=1", "is 'siso=1'; expected decode=N siso=N or itsSys [0]=[...]"},
    };
    for (const auto& [line, content, problem] : faults) {
        std::vector<std::string> changed = lines;
        changed.at(line) = content;
        expectRefused(textOf(changed),
                      "line " + std::to_string(line + 1) + (problem[0] == ',' ? "" : " ") + problem);
    }
}

TEST(TraceTextReader, TellsWhereATraceIsCutShort) {
    const std::string text = smallTraceCase().text;
    const std::size_t row = text.find("\n42 ") + 1;
    const std::size_t second = text.find("\nitsPar0[0]=[") + 1;
    const std::string expected =
        "; expected a trace: a line of dashes, a CSV header, a JSON object or an npy header";
    const std::vector<std::pair<std::size_t, std::string>> cuts = {
        {60, "line 1 is cut short after '" + std::string(40, '-') + "...'" + expected},
        {121, "ends before line 2; expected decode=N siso=N or itsSys [0]=[...]"},
        {second, "ends before line 3; expected itsPar0[0]=[...]"},
        {second + 16, "line 3 is cut short after 'itsPar0[0]=[224'; expected itsPar0[0]=[...]"},
        {row + 8, "line 53 is cut short after '42   -0.'; expected a step and 23 values"},
    };
    for (const auto& [size, problem] : cuts) {
        expectRefused(text.substr(0, size), problem);
    }
}

TEST(TraceTextReader, ReadsRowsAndColumnsInAnyOrderWithoutSoftInputs) {
    std::istringstream stream("---\ndecode=7 siso=3\nn llr a3\n 9 +1.5 x\n8 -2 3\n");
    const auto reader = tool::makeTraceReader(stream, "trace.txt", std::nullopt);
    tool::TraceRow row;
    ASSERT_TRUE(reader->next(row));
    EXPECT_EQ(row.block, 7U);
    EXPECT_EQ(row.pass, 3U);
    EXPECT_EQ(row.step, 9U);
    EXPECT_EQ(row.line, 4U);
    ASSERT_EQ(row.values.size(), 2U);
    EXPECT_EQ(row.values[0], std::pair(*tool::columnUnder("llr"), tool::TraceValue::ofRaw(12)));
    EXPECT_EQ(row.values[1], std::pair(*tool::columnUnder("a3"), tool::TraceValue::unknown()));
    ASSERT_TRUE(reader->next(row));
    EXPECT_EQ(row.step, 8U);
    EXPECT_EQ(row.values[0].second.raw(), -16);
    EXPECT_FALSE(reader->next(row));
}

}  // namespace quarzel::test
