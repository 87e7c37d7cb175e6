// SPDX-License-Identifier: MIT
#include "sweeps/ebn0_list.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.hpp"

namespace quarzel::test {

namespace {

std::vector<std::int32_t> micro(const std::string& text) {
    std::vector<std::int32_t> values;
    for (const link::Decibels& value : tool::readEbN0List("--ebn0", text)) {
        values.push_back(value.micro);
    }
    return values;
}

std::string complaintOf(const std::string& text) {
    try {
        tool::readEbN0List("--ebn0", text);
    } catch (const tool::ToolError& error) {
        EXPECT_EQ(error.code(), tool::ExitCode::usage);
        return error.what();
    }
    return "none";
}

}  // namespace

TEST(EbN0List, IsReadExactly) {
    EXPECT_THAT(micro("0.4:0.2:0.8"), testing::ElementsAre(400000, 600000, 800000));
    EXPECT_THAT(micro("0:0.1:1.5"), testing::SizeIs(16));
    EXPECT_THAT(micro("1:-0.5:-0.5"), testing::ElementsAre(-500000, 0, 500000, 1000000));
    EXPECT_THAT(micro("0:0.4:1"), testing::ElementsAre(0, 400000, 800000));
    EXPECT_THAT(micro("2:1:2"), testing::ElementsAre(2000000));
    EXPECT_THAT(micro("3,+1,.5,-2.,1"), testing::ElementsAre(-2000000, 500000, 1000000, 3000000));
    EXPECT_THAT(micro("0.000001"), testing::ElementsAre(1));
    EXPECT_EQ(tool::readEbN0List("", "0:0.1:1.5")[3].value(), 0.3);
}

TEST(EbN0List, RefusesWhatIsNoneInOneLine) {
    const std::string howTo = "; give numbers as 0.5 or ranges as 0:0.1:1.5, separated by commas";
    EXPECT_EQ(complaintOf(""), "--ebn0: '' is not a number of dB" + howTo);
    EXPECT_EQ(complaintOf("1,,2"), "--ebn0: '' is not a number of dB" + howTo);
    EXPECT_EQ(complaintOf("nan"), "--ebn0: 'nan' is not a number of dB" + howTo);
    EXPECT_EQ(complaintOf("1e1"), "--ebn0: '1e1' is not a number of dB" + howTo);
    EXPECT_EQ(complaintOf("-.+1"), "--ebn0: '-.+1' is not a number of dB" + howTo);
    EXPECT_EQ(complaintOf("0.1234567"), "--ebn0: '0.1234567' has more than 6 decimals" + howTo);
    EXPECT_EQ(complaintOf("99999999999999999999"),
              "--ebn0: '99999999999999999999' is not a number of dB" + howTo);
    EXPECT_EQ(complaintOf("4000"), "--ebn0: '4000' lies outside -20 to 40 dB" + howTo);
    EXPECT_EQ(complaintOf("0:1"), "--ebn0: the range '0:1' does not have three parts; write FIRST:STEP:LAST");
    EXPECT_EQ(complaintOf("0:0:1"),
              "--ebn0: the range '0:0:1' never ends: its step is 0; give a step above 0");
    EXPECT_EQ(
        complaintOf("0:-1:1"),
        "--ebn0: the range '0:-1:1' never ends: its step leads away from its last value; give a step with "
        "the other sign");
    EXPECT_EQ(
        complaintOf("0:0.0001:1.5"),
        "--ebn0: the range '0:0.0001:1.5' has 15001 values, more than 10000; make it shorter or its step "
        "larger");
}

}  // namespace quarzel::test
