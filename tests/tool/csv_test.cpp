// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <sstream>

#include "captures/capture_file.hpp"
#include "files/input_file.hpp"
#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// A capture as text.
std::string csv(const xt::xarray<std::int8_t>& soft, const std::string& lineEnd = "\n") {
    std::ostringstream text;
    text << "systematic,parity1,parity2" << lineEnd;
    for (std::size_t block = 0; block < soft.shape(0); ++block) {
        text << (block > 0 ? lineEnd : "");
        for (std::size_t position = 0; position < soft.shape(2); ++position) {
            text << int{soft(block, 0, position)} << ',' << int{soft(block, 1, position)} << ','
                 << int{soft(block, 2, position)} << lineEnd;
        }
    }
    return text.str();
}

/// The soft values in a capture as text.
std::vector<std::int32_t> softOf(const std::string& text) {
    std::istringstream stream(text);
    return tool::readCapture(stream, "capture.csv").soft;
}

/// Expect that the text holds what the shipped capture of small blocks does.
void expectSmallBlocks(const std::string& text) {
    const std::string file = shipped("k40.soft.npy");
    std::ifstream stream = tool::openInput(file);
    EXPECT_EQ(softOf(text), tool::readCapture(stream, file).soft);
}

}  // namespace

TEST(Csv, IsDecodedAsTheSameValuesInNpyAre) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("capture.csv", csv(shippedSoft("k40.soft.npy")));
    const std::string out = directory.path("out.npy");
    const ToolRun run = runTool({"decode", file, "-o", out});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(readFile(out), readFile(shipped("k40.decided.npy")));
}

TEST(Csv, MayHaveCarriageReturnsAtItsLineEnds) {
    expectSmallBlocks(csv(shippedSoft("k40.soft.npy"), "\r\n"));
}

TEST(Csv, MayEndWithEmptyLines) {
    expectSmallBlocks(csv(shippedSoft("k40.soft.npy")) + "\n\n");
}

TEST(Csv, MayEndWithoutALineEnd) {
    std::string text = csv(shippedSoft("k40.soft.npy"));
    text.pop_back();
    expectSmallBlocks(text);
}

TEST(Csv, MayBeginWithAByteOrderMark) {
    expectSmallBlocks("\xef\xbb\xbf" + csv(shippedSoft("k40.soft.npy")));
}

TEST(Csv, MayHaveSeveralEmptyOrBlankLinesBetweenBlocks) {
    std::string text = csv(shippedSoft("k40.soft.npy"));
    const std::size_t gap = text.find("\n\n");
    ASSERT_NE(gap, std::string::npos);
    text.insert(gap + 1, "\n \t\n");
    expectSmallBlocks(text);
}

TEST(Csv, IsReadToItsEndHoweverLong) {
    // Lines of 4096 bytes, so that in the reader's buffer a stale line end stands just behind the last line,
    // which has none of its own.
    const auto soft = shippedSoft("k6144.soft.npy");
    std::string text;
    const auto addLine = [&text](std::string line) {
        line.resize(4095, ' ');
        text += line + '\n';
    };
    addLine("systematic,parity1,parity2");
    for (std::size_t block = 0; block < 2; ++block) {
        addLine("");
        for (std::size_t position = 0; position < 6148; ++position) {
            addLine(std::to_string(soft(block, 0, position)) + ',' +
                    std::to_string(soft(block, 1, position)) + ',' +
                    std::to_string(soft(block, 2, position)));
        }
    }
    text.pop_back();
    EXPECT_EQ(softOf(text), std::vector<std::int32_t>(soft.begin(), soft.begin() + 2L * 3 * 6148));
}

}  // namespace quarzel::test
