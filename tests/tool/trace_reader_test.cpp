// SPDX-License-Identifier: MIT
#include "trace/trace_reader.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "refusal.hpp"
#include "trace_cases.hpp"

namespace quarzel::test {

namespace {

/// Read a trace to its end.
/// @return the values of all its tables
std::size_t readAll(const std::string& text) {
    std::istringstream stream(text);
    tool::TraceReader reader(stream, "trace.txt", false);
    std::size_t values = 0;
    while (const auto table = reader.next()) {
        values += table->values.size();
    }
    return values;
}

void expectRefused(const std::string& text, const std::string& problem) {
    EXPECT_EQ(refusalOf([&] { readAll(text); }), "quarzel: error: trace.txt: " + problem + '\n');
}

}  // namespace

TEST(TraceReader, TellsWhichLineItCouldNotRead) {
    const std::string png = "\x89PNG\r\n\x1a\n\0\0\0\rIHDR";
    const std::vector<std::pair<std::string, std::string>> foreign = {
        {"", "is empty; expected a line of dashes"},
        {"\n \n", "ends before line 3; expected a line of dashes"},
        {png, "line 1 is '?PNG'; expected a line of dashes"},
        {std::string("\x7f"
                     "ELF\0",
                     5),
         "line 1 is cut short after '?ELF?'; expected a line of dashes"},
        {"systematic,parity1,parity2\n1,2,3\n",
         "line 1 is 'systematic,parity1,parity2'; expected a line of dashes"},
        {"block,pass,step,signal,state,raw,real\n1,,0,code1_sys,,9,1.125000\n",
         "line 1 is 'block,pass,step,signal,state,raw,real'; expected a line of dashes"},
        {"[\n{\"block\":1}\n]\n", "line 1 is '['; expected a line of dashes"},
        {std::string(1 << 20, '-'), "line 1 is longer than 65535 characters; expected a line of dashes"},
        {std::string(1 << 20, '\0') + '\n',
         "line 1 is longer than 65535 characters; expected a line of dashes"},
        {"----\ndecode=0 siso=0\n", "line 2 is 'decode=0 siso=0'; expected itsSys [0]=[...]"},
    };
    for (const auto& [content, problem] : foreign) {
        expectRefused(content, problem);
    }
}

TEST(TraceReader, TellsWhatIsWrongWithALine) {
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
        {9, "n int a0", "is 'n int a0'; expected the heading of the columns, 'n int a0 ... ext'"},
        {9, lines[9] + " x",
         "is 'n    int           a0          a1       ...'; expected the heading of the columns, 'n int a0 "
         "... ext'"},
        {15, "6" + row.substr(1),
         "is '6    -0.250000     +9.625000   +6.875000...'; expected step 5 of 0 to 42"},
        {15, "", "is ''; expected step 5 of 0 to 42"},
        {15, "x", "is 'x'; expected step 5 of 0 to 42"},
        {15, "5 +0.5 -1", "is a row that ends before column a1; expected a step and 23 values"},
        {15, row + " 0", "is a row with more columns than ext; expected a step and 23 values"},
        {15, "5 +0.5 0.1", ", column a0 is '0.1'; expected a multiple of 0.125 from -256 to 255.875"},
        {15, "5 +0.5 256", ", column a0 is '256'; expected a multiple of 0.125 from -256 to 255.875"},
        {15, "5 -256.125", ", column int is '-256.125'; expected a multiple of 0.125 from -256 to 255.875"},
        {15, "5 +-1", ", column int is '+-1'; expected a multiple of 0.125 from -256 to 255.875"},
        {15, "5 nan", ", column int is 'nan'; expected a multiple of 0.125 from -256 to 255.875"},
        {15, "5 inf", ", column int is 'inf'; expected a multiple of 0.125 from -256 to 255.875"},
        {15, "5 1,5", ", column int is '1,5'; expected a multiple of 0.125 from -256 to 255.875"},
        {53, "decode=0 siso=1", "is 'decode=0 siso=1'; expected a line of dashes"},
        {54, "siso=1", "is 'siso=1'; expected decode=N siso=N or itsSys [0]=[...]"},
    };
    for (const auto& [line, content, problem] : faults) {
        std::vector<std::string> changed = lines;
        changed.at(line) = content;
        expectRefused(textOf(changed),
                      "line " + std::to_string(line + 1) + (problem[0] == ',' ? "" : " ") + problem);
    }
}

TEST(TraceReader, TellsWhereATraceIsCutShort) {
    const std::string text = smallTraceCase().text;
    const std::size_t row = text.find("\n42 ") + 1;
    const std::size_t second = text.find("\nitsPar0[0]=[") + 1;
    const std::vector<std::pair<std::size_t, std::string>> cuts = {
        {60, "line 1 is cut short after '" + std::string(40, '-') + "...'; expected a line of dashes"},
        {120, "line 1 is cut short after '" + std::string(40, '-') + "...'; expected a line of dashes"},
        {121, "ends before line 2; expected itsSys [0]=[...]"},
        {second, "ends before line 3; expected itsPar0[0]=[...]"},
        {second + 16, "line 3 is cut short after 'itsPar0[0]=[224'; expected itsPar0[0]=[...]"},
        {row, "ends before line 53; expected step 42 of 0 to 42"},
        {row + 8, "line 53 is cut short after '42   -0.'; expected step 42 of 0 to 42"},
    };
    for (const auto& [size, problem] : cuts) {
        expectRefused(text.substr(0, size), problem);
    }
}

TEST(TraceReader, NamesTheLineWhereverATraceIsCutShort) {
    // The second block would only be more of the same.
    const std::string text = smallTraceCase().text.substr(0, 15000);
    const std::size_t firstRuler = text.find("\n-") + 1;
    const std::size_t endOfFirstPass = text.find("\n-", firstRuler + 1) + 1;
    const std::size_t inputs = 6 * 43;
    const std::size_t pass = 23 * 43;
    std::size_t cutShort = 0;
    for (std::size_t size = 0; size < endOfFirstPass + 200; ++size) {
        const std::string start = text.substr(0, size);
        if (size == endOfFirstPass) {
            EXPECT_EQ(readAll(start), inputs + pass) << "a trace may end here";
            continue;
        }
        const auto line = std::to_string(1 + std::count(start.begin(), start.end(), '\n'));
        const std::string found = size == 0              ? "is empty; expected "
                                  : start.back() == '\n' ? "ends before line " + line + "; expected "
                                                         : "line " + line + " is cut short after '";
        const std::string refusal = refusalOf([&] { readAll(start); });
        ASSERT_TRUE(refusal.starts_with("quarzel: error: trace.txt: " + found)) << size << ": " << refusal;
        ++cutShort;
    }
    EXPECT_GT(cutShort, 13000U);
}

TEST(TraceReader, KnowsWhatItReadsByThePlaceInTheTrace) {
    std::istringstream stream(smallTraceCase().text);
    tool::TraceReader reader(stream, "trace.txt", false);
    const auto inputs = reader.next();
    ASSERT_TRUE(inputs);
    EXPECT_EQ(inputs->decode, 0U);
    EXPECT_FALSE(inputs->siso);
    EXPECT_EQ(inputs->steps, 43U);
    EXPECT_EQ(inputs->firstLine, 2U);
    EXPECT_EQ(inputs->values.size(), 6U * 43);
    EXPECT_EQ(inputs->values[0], 208);
    const auto pass = reader.next();
    ASSERT_TRUE(pass);
    EXPECT_EQ(pass->decode, 0U);
    EXPECT_EQ(pass->siso, 0U);
    EXPECT_EQ(pass->firstLine, 11U);
    EXPECT_EQ(pass->values.size(), 23U * 43);
    EXPECT_EQ(pass->values[0], 96) << "+0.750000 in steps of 1/128";
}

}  // namespace quarzel::test
