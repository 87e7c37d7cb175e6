// SPDX-License-Identifier: MIT
// Captures of real numbers.
#include <gtest/gtest.h>

#include <sstream>

#include "captures/capture_file.hpp"
#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// The shipped capture of small blocks as real numbers that a factor of 4 turns into its soft values again.
template <class Real>
xt::xarray<Real> ratios() {
    return xt::cast<Real>(shippedSoft("k40.soft.npy")) / Real{4} + Real{0.1F};
}

template <class Real>
std::string npyOf(const xt::xarray<Real>& values) {
    return xt::dump_npy(values);
}

/// Expect that a capture of real numbers is decided as the shipped one is.
void expectDecided(const std::string& name, const std::string& content, const std::string& option,
                   const std::string& scale) {
    const TemporaryDirectory directory;
    const std::string file = directory.write(name, content);
    const std::string out = directory.path("out.npy");
    const ToolRun run = runTool({"decode", file, option, scale, "--units", "8", "-o", out});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(readFile(out), readFile(shipped("k40.decided.npy")));
}

/// The soft values of one position of a block in text.
std::vector<std::int32_t> firstSoft(const std::string& firstLine, double scale) {
    std::string text = "systematic,parity1,parity2\n" + firstLine + '\n';
    for (int line = 1; line < 44; ++line) {
        text += "0,0,0\n";
    }
    std::istringstream stream(text);
    const std::vector<std::int32_t> soft = tool::readCapture(stream, "a.csv", scale).soft;
    return {soft[0], soft[44], soft[88]};
}

}  // namespace

TEST(RealCapture, IsDecidedAsItsSoftValuesAre) {
    expectDecided("a.npy", npyOf(ratios<float>()), "--llr", "4");
    expectDecided("a.npy", npyOf(ratios<double>()), "--llr", "4");
    expectDecided("a.npy", npyOf(xt::xarray<double>(ratios<double>() / 10.0)), "--scale", "40");
}

TEST(RealCapture, MayBeText) {
    const auto values = ratios<double>();
    std::ostringstream text;
    text << "systematic,parity1,parity2\n";
    for (std::size_t block = 0; block < values.shape(0); ++block) {
        for (std::size_t position = 0; position < values.shape(2); ++position) {
            text << values(block, 0, position) << ',' << values(block, 1, position) << ','
                 << values(block, 2, position) << '\n';
        }
        text << '\n';
    }
    expectDecided("a.csv", text.str(), "--llr", "4");
    EXPECT_EQ(firstSoft("0.3,-1e3,inf", 4), (std::vector<std::int32_t>{1, -128, 127}));
    EXPECT_EQ(firstSoft("3,-2.75e-1, 0 ", 2), (std::vector<std::int32_t>{6, -1, 0}));
}

TEST(RealCapture, NeedsToBeToldWhatItHolds) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("a.npy", npyOf(ratios<float>()));
    const ToolRun run = runTool({"decode", file});
    EXPECT_EQ(run.err, "quarzel: error: " + file +
                           ": holds values of type '<f4'; give --llr 4 when they are log-likelihood ratios, "
                           "--scale S when they are samples\n");
    EXPECT_EQ(run.exitCode, 3);
}

}  // namespace quarzel::test
