// SPDX-License-Identifier: MIT
#include "trace/trace_writer.hpp"

#include <gtest/gtest.h>

#include <iomanip>
#include <memory>
#include <sstream>

#include "support/locale_guard.hpp"
#include "trace/trace_decoder.hpp"

namespace quarzel::test {

namespace {

/// Trace two passes of a block to a stream.
void traceBlock(const std::string& form, std::ostream& stream) {
    vardel_ip_quarzel_generics generics;
    const std::unique_ptr<vardel_ip_quarzel_state, decltype(&vardel_ip_quarzel_destroy_state)> model(
        vardel_ip_quarzel_create_state(*vardel_ip_quarzel_get_default_generics(&generics)),
        vardel_ip_quarzel_destroy_state);
    const auto writer = tool::makeTraceWriter(form, stream);
    tool::traceTo(*writer, *model);
    vardel_ip_quarzel_bitacc_dump_config(model.get(), 2);
    std::vector<int> soft(1028);
    for (std::size_t i = 0; i < soft.size(); ++i) {
        soft[i] = static_cast<int>(i * 37 % 61) - 30;
    }
    std::vector<unsigned char> bits(1024);
    vardel_ip_quarzel_outputs outputs{bits.data(), 1024, 0, 0};
    ASSERT_EQ(vardel_ip_quarzel_bitacc_simulate(model.get(), &outputs,
                                                {soft.data(), soft.data(), soft.data(), 1028, 1, 0}),
              0);
    writer->end();
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

INSTANTIATE_TEST_SUITE_P(TraceWriter, TraceForms, testing::Values("text", "csv", "json"));

}  // namespace quarzel::test
