// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <nlohmann/json.hpp>
#include <sstream>

#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

using Bits = std::vector<std::string>;

/// Six blocks of 40 and six of 48 bits, each three times with 2 and with 6 iterations, and what `quarzel
/// compare` makes of decisions that differ from those expected.
class CompareBlocks : public testing::Test {
  protected:
    CompareBlocks() {
        EXPECT_EQ(
            runTool({"vectors", itsSet, "--block-size", "40,48", "--iterations", "2,6", "--blocks", "3"})
                .exitCode,
            0);
        std::istringstream lines(readFile(itsSet + "/u2_a1/dout.hex"));
        for (std::string line; std::getline(lines, line);) {
            if (!line.starts_with("//")) {
                itsBits.push_back(line);
            }
        }
    }

    /// Call a function with the first and behind the last bit of each block.
    void forEachBlock(const std::function<void(Bits::iterator, Bits::iterator)>& function) {
        auto first = itsBits.begin();
        for (int block = 0; block < 12; ++block) {
            const auto last = first + (block < 6 ? 40 : 48);
            function(first, last);
            first = last;
        }
    }

    ToolRun compare(const std::vector<std::string>& options = {}) {
        std::string text;
        for (const std::string& bit : itsBits) {
            text += bit + '\n';
        }
        std::vector<std::string> arguments = {"compare", itsSet, itsDirectory.write("sim.hex", text)};
        arguments.insert(arguments.end(), options.begin(), options.end());
        return runTool(arguments);
    }

    nlohmann::json report() { return nlohmann::json::parse(compare({"--json"}).out); }

    /// The hint of the text; empty when there is none.
    std::string hint() {
        const std::string text = compare().out;
        const std::string label = "\nhint          ";
        const std::size_t at = text.find(label);
        const std::string rest = at == std::string::npos ? "" : text.substr(at + label.size());
        return rest.substr(0, rest.find('\n'));
    }

    static void flip(std::string& bit) { bit = bit == "0" ? "1" : "0"; }

    TemporaryDirectory itsDirectory;
    std::string itsSet = itsDirectory.path("set");
    Bits itsBits;
};

}  // namespace

TEST_F(CompareBlocks, AreAllNamedAndCountedByWhatTheyAre) {
    flip(itsBits[0]);       // block 0
    flip(itsBits[4 * 40]);  // block 4
    itsBits[4 * 40 + 39] = "x";
    flip(itsBits[6 * 40 + 2 * 48 + 47]);  // block 8
    const std::string text = compare().out;
    EXPECT_NE(text.find("blocks        3 of 12 differ: 0, 4, 8\n"
                        "bits          4 of 528 differ: 3 wrong, 1 undefined (x)\n"
                        "by K          40: 2 of 6, 48: 1 of 6\n"
                        "by iterations 2: 2 of 6, 6: 1 of 6\n"
                        "by stimulus   noise: 3 of 12\n"
                        "by place      2 0 0 0 0 0 0 2 bits in the eighths of a block\n"
                        "\nThe model's trace of this block:\n"),
              std::string::npos)
        << text;
    const nlohmann::json object = report();
    EXPECT_EQ(object.at("blocks_differing"), 3);
    EXPECT_EQ(object.at("bits_by_eighth"), nlohmann::json::parse("[2,0,0,0,0,0,0,2]"));
    EXPECT_EQ(object.at("hint"), nullptr) << "a few wrong bits tell nothing";
    const nlohmann::json& failing = object.at("failing");
    ASSERT_EQ(failing.size(), 3U);
    nlohmann::json second = failing[1];
    EXPECT_EQ(second.at("trace_command").get<std::string>().substr(0, 15), "quarzel decode ");
    second.erase("trace_command");
    EXPECT_EQ(second,
              nlohmann::json::parse(
                  R"({"block": 4, "block_size": 40, "iterations": 6, "stimulus": "noise", "first_bit": 0,
                              "bits_differing": 2, "wrong": 1, "undefined": 1, "undriven": 0, "missing": 0})"));
    EXPECT_EQ(failing[2].at("block"), 8);
    EXPECT_EQ(failing[2].at("first_bit"), 47);
}

TEST_F(CompareBlocks, AreAllInJsonAndTenInText) {
    forEachBlock([](auto first, auto) { flip(*first); });
    EXPECT_NE(compare().out.find("blocks        12 of 12 differ: 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, and 2 more\n"),
              std::string::npos);
    EXPECT_EQ(report().at("failing").size(), 12U);
}

TEST_F(CompareBlocks, GiveAHintWhenTheyAreInverted) {
    forEachBlock([](auto first, auto last) { std::for_each(first, last, flip); });
    EXPECT_EQ(hint(), "each block that differs is inverted");
    EXPECT_EQ(report().at("hint").at("kind"), "inverted");
}

TEST_F(CompareBlocks, GiveAHintWhenOneAloneIsInverted) {
    std::for_each(itsBits.begin() + 80, itsBits.begin() + 120, flip);
    EXPECT_EQ(hint(), "each block that differs is inverted");
}

TEST_F(CompareBlocks, GiveAHintWhenTheyAreReversed) {
    forEachBlock([](auto first, auto last) { std::reverse(first, last); });
    EXPECT_EQ(hint(), "each block that differs comes in reversed order, last bit first");
}

TEST_F(CompareBlocks, GiveAHintWhenTheirBytesAreReversed) {
    forEachBlock([](auto first, auto last) {
        for (; first != last; first += 8) {
            std::reverse(first, first + 8);
        }
    });
    EXPECT_EQ(hint(), "each 8 bits of the blocks that differ are reversed");
}

TEST_F(CompareBlocks, GiveAHintWhenEachIsShifted) {
    forEachBlock([](auto first, auto last) {
        std::shift_right(first, last, 3);
        std::fill(first, first + 3, "x");
    });
    EXPECT_EQ(hint(), "each block that differs comes 3 bits late");
}

TEST_F(CompareBlocks, GiveAHintWhenABitIsLost) {
    itsBits.erase(itsBits.begin() + 100);
    EXPECT_EQ(hint(), "all decisions from the first difference on come 1 bit early");
    EXPECT_EQ(report().at("hint").at("kind"), "shifted");
}

TEST_F(CompareBlocks, GiveAHintWhenBitsAreTooMany) {
    itsBits.insert(itsBits.begin(), 5, "0");
    EXPECT_EQ(hint(), "all decisions from the first difference on come 5 bits late");
}

TEST_F(CompareBlocks, GiveAHintWhenTheyAreSwapped) {
    std::swap_ranges(itsBits.begin() + 40, itsBits.begin() + 80, itsBits.begin() + 120);
    // Blocks 0 and 3 have the same decisions, after 2 and after 6 iterations.
    EXPECT_EQ(hint(), "2 of 2 blocks that differ hold the decisions of others, as block 1 those of block 0");
    EXPECT_EQ(report().at("hint").at("kind"), "swapped");
}

TEST_F(CompareBlocks, GiveNoHintWhenNothingExplainsThem) {
    for (std::size_t i = 0; i < itsBits.size(); i += 1 + i % 5) {
        flip(itsBits[i]);
    }
    EXPECT_EQ(hint(), "");
    std::fill(itsBits.begin(), itsBits.end(), "x");
    EXPECT_EQ(hint(), "");
}

}  // namespace quarzel::test
