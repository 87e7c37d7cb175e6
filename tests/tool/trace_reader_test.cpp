// SPDX-License-Identifier: MIT
#include "trace/trace_reader.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "tool_error.hpp"
#include "trace_cases.hpp"

namespace quarzel::test {

namespace {

/// Read a trace to its end.
/// @return the values of all its tables
std::size_t readAll(const std::string& text) {
    std::istringstream stream(text);
    tool::TraceReader reader(stream, "cut.txt", false);
    std::size_t values = 0;
    while (const auto table = reader.next()) {
        values += table->values.size();
    }
    return values;
}

}  // namespace

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
        const std::string found = size == 0              ? "cut.txt: is empty; expected "
                                  : start.back() == '\n' ? "cut.txt: ends before line " + line + "; expected "
                                                         : "cut.txt: line " + line + " is cut short after '";
        try {
            readAll(start);
            FAIL() << "read the first " << size << " characters";
        } catch (const tool::ToolError& error) {
            EXPECT_EQ(error.code(), tool::ExitCode::file);
            EXPECT_TRUE(std::string(error.what()).starts_with(found)) << error.what();
            ++cutShort;
        }
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
