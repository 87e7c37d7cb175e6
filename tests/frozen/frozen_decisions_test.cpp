// SPDX-License-Identifier: MIT
// The decisions of every core for inputs that anybody can make are those that were stored.
#include "frozen/frozen_decisions.hpp"

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <tuple>

#include "frozen/frozen_core.hpp"
#include "lanes/lane_setup.hpp"
#include "oracle/plain_decoder.hpp"

namespace quarzel::test {
namespace {

const std::string file = std::string(QUARZEL_TEST_DATA) + "/frozen_decisions.csv";

/// The decoder that shares nothing with the product.
Decisions decodePlainly(const FrozenCase& which, const std::vector<Block>& blocks) {
    oracle::PlainDecoder decoder(
        oracle::soundDesign(static_cast<int>(which.units), static_cast<int>(which.algorithm)));
    Decisions decisions;
    for (const Block& block : blocks) {
        decisions.push_back(
            decoder.decode({block.systematic, block.parity1, block.parity2}, block.iterations, 0).decisions);
    }
    return decisions;
}

/// Decode by frozen_decoder on another processor.
/// @param program  it, with its emulator before it
Decisions decodeElsewhere(const std::string& program, const FrozenCase& which,
                          const std::vector<Block>& blocks) {
    const std::string in = testing::TempDir() + "frozen_soft_values_" + std::to_string(getpid());
    const std::string out = testing::TempDir() + "frozen_bits_" + std::to_string(getpid());
    std::ofstream soft(in, std::ios::binary);
    for (const Block& block : blocks) {
        soft.put(static_cast<char>(block.iterations));
        for (const std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
            std::transform(stream->begin(), stream->end(), std::ostreambuf_iterator<char>(soft),
                           [](int value) { return static_cast<char>(value); });
        }
    }
    soft.close();
    const std::string command = program + ' ' + std::to_string(which.units) + ' ' +
                                std::to_string(which.algorithm) + ' ' + std::to_string(which.K) + " <" + in +
                                " >" + out;
    EXPECT_EQ(std::system(command.c_str()), 0) << command;
    std::ifstream bits(out, std::ios::binary);
    Decisions decisions(blocks.size(), std::vector<unsigned char>(which.K, 0xEE));
    for (std::vector<unsigned char>& block : decisions) {
        bits.read(reinterpret_cast<char*>(block.data()), static_cast<std::streamsize>(block.size()));
    }
    std::remove(in.c_str());
    std::remove(out.c_str());
    return decisions;
}

std::vector<std::string> storedLines() {
    std::ifstream stream(file);
    std::vector<std::string> lines;
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

TEST(FrozenDecisions, AreStoredForEveryCoreAndBlockSize) {
    const std::vector<FrozenCase> cases = frozenCases();
    if (const char* const renew = std::getenv("QUARZEL_RENEW_GOLDEN"); renew && renew == std::string("1")) {
        std::ofstream stream(file);
        stream << frozenHeader() << '\n';
        for (const FrozenCase& which : cases) {
            stream << frozenLine(which, FrozenCore(which, "literal")) << '\n';
        }
        ASSERT_TRUE(stream.flush()) << file;
    }
    const std::vector<std::string> lines = storedLines();
    ASSERT_EQ(lines.size(), 1 + cases.size());
    EXPECT_EQ(cases.size() * frozenClassNames.size() * frozenIterations.size(), 33840U);
    EXPECT_EQ(lines.front(), frozenHeader());
    for (std::size_t i = 0; i < cases.size(); ++i) {
        const std::string start = std::to_string(cases[i].K) + ',' + std::to_string(cases[i].units) + ',' +
                                  std::to_string(cases[i].algorithm) + ',';
        EXPECT_EQ(lines[1 + i].substr(0, start.size()), start);
        EXPECT_EQ(lines[1 + i].size(), start.size() - 1 + 20 * 17);
    }
}

/// One of the nine pairs of units and algorithm: a part of the cases that other programs check beside it.
class FrozenPart : public testing::TestWithParam<std::size_t> {
  protected:
    /// Call work(case, stored line) for the cases of the pair: every size in the long run, else a ninth.
    template <class Work>
    void forEachCase(Work&& work) const {
        const std::vector<FrozenCase> cases = frozenCases();
        const std::vector<std::string> lines = storedLines();
        ASSERT_EQ(lines.size(), 1 + cases.size());
        for (std::size_t i = 0; i < cases.size(); ++i) {
            const std::size_t size = i / 9;
            if (i % 9 == GetParam() && (exhaustive() || size % 9 == GetParam())) {
                work(cases[i], lines[1 + i]);
            }
        }
    }
};

TEST_P(FrozenPart, IsWhatEveryImplementationDecides) {
    const std::vector<std::string> names = implementations();
    ASSERT_GE(names.size(), 2U);
    forEachCase([&](const FrozenCase& which, const std::string& line) {
        for (const std::string& name : names) {
            if (exhaustive() || name != "literal" || which.K <= 1024) {
                EXPECT_EQ(frozenLine(which, FrozenCore(which, name)), line) << name;
            }
        }
    });
}

TEST_P(FrozenPart, IsWhatADecoderWrittenAnewDecides) {
    forEachCase([&](const FrozenCase& which, const std::string& line) {
        if (exhaustive() || which.K <= 256) {
            EXPECT_EQ(frozenLine(which, [&](const auto& blocks) { return decodePlainly(which, blocks); }),
                      line);
        }
    });
}

TEST_P(FrozenPart, IsWhatAnotherProcessorDecides) {
    const char* const program = std::getenv("QUARZEL_FROZEN_DECODER");
    if (program == nullptr) {
        GTEST_SKIP() << "QUARZEL_FROZEN_DECODER names no program for one";
    }
    forEachCase([&](const FrozenCase& which, const std::string& line) {
        if (exhaustive() || which.K <= 1024) {
            EXPECT_EQ(frozenLine(which,
                                 [&](const auto& blocks) { return decodeElsewhere(program, which, blocks); }),
                      line);
        }
    });
}

INSTANTIATE_TEST_SUITE_P(UnitsAndTypes, FrozenPart, testing::Range<std::size_t>(0, 9), [](const auto& part) {
    return std::to_string(2U << (part.param / 3)) + "UnitsType" + std::to_string(part.param % 3);
});

}  // namespace
}  // namespace quarzel::test
