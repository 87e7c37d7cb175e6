// SPDX-License-Identifier: MIT
#include "trace/trace_file.hpp"

#include <gtest/gtest.h>

#include <iomanip>
#include <sstream>

#include "support/locale_guard.hpp"

namespace quarzel::test {

namespace {

/// Trace two passes of a block to a stream.
void traceBlock(const std::string& form, std::ostream& stream) {
    tool::TraceOptions options;
    options.passes = 2;
    options.form = form;
    tool::TraceFile trace(options, stream);
    Core core(CoreSettings{}, [&](MessageKind, std::string_view text) { trace.writeLine(text); });
    trace.start(core);
    std::vector<std::int8_t> soft(3 * 1028);
    for (std::size_t i = 0; i < soft.size(); ++i) {
        soft[i] = static_cast<std::int8_t>(i % 1028 * 37 % 61 - 30);
    }
    std::vector<unsigned char> bits(1024);
    core.decode(softBlocks(std::span<const std::int8_t>(soft), 1028), 1, bits);
    trace.finish();
}

}  // namespace

class TraceForms : public testing::TestWithParam<const char*> {};

TEST_P(TraceForms, AreTheSameWhateverTheSettingsOfTheStreamAndLeaveThem) {
    std::ostringstream plain;
    traceBlock(GetParam(), plain);
    ASSERT_GT(plain.str().size(), 100000U);

    const GroupingLocale grouping;
    std::ostringstream odd;
    odd.imbue(std::locale());
    odd << std::hex << std::showbase << std::scientific << std::setprecision(2) << std::setfill('*')
        << std::setw(9);
    const auto flags = odd.flags();
    traceBlock(GetParam(), odd);
    EXPECT_TRUE(odd.str() == plain.str());
    EXPECT_EQ(odd.flags(), flags);
    EXPECT_EQ(odd.precision(), 2);
    EXPECT_EQ(odd.fill(), '*');
    EXPECT_EQ(odd.width(), 9);
    EXPECT_EQ(odd.rdstate(), std::ios::goodbit);
}

INSTANTIATE_TEST_SUITE_P(TraceFile, TraceForms, testing::Values("text", "csv", "json", "vcd"));

}  // namespace quarzel::test
