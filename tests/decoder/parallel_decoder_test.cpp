// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <regex>
#include <sstream>

#include "decoder/decoder_3gpu.hpp"
#include "support/capture.hpp"
#include "support/decoder_setup.hpp"

namespace quarzel::test {
namespace {

using Decoder = OpenDecoder<TDecoder3GPU>;

constexpr const char* notSupported = "ERROR:TDecoder3GPU:Block size not supported\n";

TEST(ParallelDecoder, CutsABlockWhenItsSizeChanges) {
    Decoder decoder("MOD", false, 4U, 4U);
    ASSERT_TRUE(decoder.allocate(6144 + 3));
    EXPECT_EQ(decoder.threadCount(), 16U);
    EXPECT_EQ(decoder.alphaSegments().size(), 16U);
    EXPECT_EQ(decoder.alphaSegments()[1].from, 384U);
    EXPECT_EQ(decoder.betaSegments().size(), 96U);
    ASSERT_TRUE(decoder.allocate(40 + 3));
    EXPECT_EQ(decoder.threadCount(), 1U);
    ASSERT_EQ(decoder.betaSegments().size(), 1U);
    EXPECT_EQ(decoder.betaSegments()[0].from, 39U);
    EXPECT_EQ(decoder.betaSegments()[0].to, 0U);
}

TEST(ParallelDecoder, SizesThatDoNotDivideAreRefusedEveryTime) {
    Decoder decoder("MOD", false, 4U, 4U);
    for (int round = 0; round < 3; ++round) {
        EXPECT_EQ(capture([&] { EXPECT_FALSE(decoder.allocate(1004 + 3)); }).err, notSupported);
        EXPECT_TRUE(decoder.allocate(1008 + 3));
        EXPECT_EQ(decoder.threadCount(), 8U);
    }
}

TEST(ParallelDecoder, BlocksWithoutTerminationAreRefused) {
    Decoder decoder("MOD", false, 1U, 2U);
    for (const unsigned steps : {0U, 1U, 2U}) {
        EXPECT_EQ(capture([&] { EXPECT_FALSE(decoder.allocate(steps)); }).err, notSupported) << steps;
    }
    EXPECT_TRUE(decoder.allocate(3));
    EXPECT_TRUE(decoder.betaSegments().empty());
}

TEST(ParallelDecoder, TailMetricsAreTheClosedFormWithLowBitsCleared) {
    constexpr unsigned K = 40;
    for (unsigned seed = 0; seed < 50; ++seed) {
        Decoder decoder("MOD", false, 2U, 4U);
        std::vector<short> soft = randomSoft(3 * K + 12, seed, 128);
        if (seed % 2 == 1) {
            std::mt19937 random(seed);
            for (short& value : soft) {
                value = static_cast<short>(random());
            }
        }
        ASSERT_TRUE(decoder.extract(soft));
        for (const unsigned siso : {0U, 1U}) {
            const unsigned d = siso == 0 ? 1 : 0;
            ASSERT_TRUE(decoder.calcIntrinsic(siso) && decoder.calcGamma(siso) && decoder.calcAlpha(siso) &&
                        decoder.calcBeta(siso));
            const auto a = [&](unsigned i) { return decoder.itsSys[d][K - 1 + i]; };
            const auto p = [&](unsigned i) { return decoder.itsPar0[d][K - 1 + i]; };
            const auto wrap = [](int value) { return static_cast<short>(value); };
            const short T = wrap(a(3) + p(3));
            const short U2 = wrap(a(2) + p(2));
            const short V2 = wrap(a(2) - p(2));
            const short U1 = wrap(a(1) + p(1));
            const short W1 = wrap(a(1) + p(1));
            const short V1 = wrap(a(1) - p(1));
            const short X1 = wrap(a(1) - p(1));
            const int expected[8] = {-T - U2 - U1, -T - U2 + U1, U2 - T + V1, U2 - T - V1,
                                     T + V2 - X1,  T + V2 + X1,  T - V2 + W1, T - V2 - W1};
            for (unsigned state = 0; state < 8; ++state) {
                EXPECT_EQ(decoder.itsBeta[K - 1][state], wrap(expected[state]) & -128)
                    << "seed " << seed << " siso " << siso << " state " << state;
            }
        }
    }
}

TEST(ParallelDecoder, TerminationStepsGetNoBranchMetrics) {
    Decoder decoder("MOD", false, 2U, 4U);
    std::vector<unsigned char> hard;
    ASSERT_TRUE(decoder.decode(randomSoft(132, 3), hard, 2));
    for (unsigned step = 40; step < 43; ++step) {
        EXPECT_TRUE(compareT8(decoder.itsGamma[step], T8{}));
        EXPECT_TRUE(compareT8(decoder.itsBeta[step], T8{}));
    }
}

TEST(ParallelDecoder, SilentUntilVerbosityIsRaised) {
    Decoder decoder("MOD", false, 2U, 4U);
    std::vector<unsigned char> hard;
    EXPECT_EQ(capture([&] { decoder.decode(randomSoft(132, 3), hard, 2); }).out, "");
}

TEST(ParallelDecoder, TracesItsCutWhenTheSizeChanges) {
    const std::string threads = "itsNT=2\n";
    const std::string segments =
        "itsAlphaSegment=[0,66) [66,132)\n"
        "itsBetaSegment =[32,0) [98,65) [65,32) [131,98)\n";
    for (const unsigned verbosity : {1U, 2U, 8U}) {
        Decoder decoder("MOD", false, 2U, 4U);
        decoder.setVerbosity(verbosity);
        EXPECT_EQ(capture([&] { decoder.allocate(132 + 3); }).out,
                  verbosity == 1 ? threads : threads + segments);
        EXPECT_EQ(capture([&] { decoder.allocate(132 + 3); }).out, "");
    }
}

TEST(ParallelDecoder, TracesNoRecursionBelowVerbosity9) {
    Decoder decoder("MOD", false, 2U, 4U);
    decoder.setVerbosity(8);
    capture([&] { decoder.allocate(128 + 3); });
    std::vector<unsigned char> hard;
    EXPECT_EQ(capture([&] { decoder.decode(randomSoft(3 * 128 + 12, 3), hard, 2); }).out, "");
}

TEST(ParallelDecoder, TracesTheThreadCountOfASizeItRefuses) {
    Decoder decoder("MOD", false, 4U, 4U);
    decoder.setVerbosity(9);
    const Output output = capture([&] { EXPECT_FALSE(decoder.allocate(1004 + 3)); });
    EXPECT_EQ(output.out, "itsNT=8\n");
    EXPECT_EQ(output.err, notSupported);
}

TEST(ParallelDecoder, TracesEveryRecursionOfAPass) {
    Decoder decoder("MOD", false, 2U, 4U);
    decoder.setVerbosity(9);
    std::vector<unsigned char> hard;
    const Output output = capture([&] { decoder.decode(std::vector<short>(3 * 128 + 12, 0), hard, 1); });
    const std::string zero = "0 0 0 0 0 0 0 0";
    const std::string start = "0 -16384 -16384 -16384 -16384 -16384 -16384 -16384";
    const auto pass = [&](const std::string& siso, const std::string& set) {
        return "TDecoder3GPU::calcAlpha(" + siso + ")\n" +                                                  //
               "from=0 to=64 init=[" + start + "] newinit=[" + start + "]\n" +                              //
               "from=64 to=128 init=[" + zero + "] newinit=[" + zero + "]\n" +                              //
               "itsAlphaInit[" + set + "]=[" + start + "] [" + zero + "] \n" +                              //
               "TDecoder3GPU::calcBeta(" + siso + ")\n" +                                                   //
               "from=63 to=0 beta[from]=[" + zero + "] beta[to]=[" + zero + "]\n" +                         //
               "from=127 to=63 beta[from]=[" + zero + "] beta[to]=[" + zero + "] init[0]=" + zero + "\n" +  //
               "itsBetaInit[" + set + "]=[" + zero + "] [" + zero + "] \n";
    };
    EXPECT_EQ(output.out, "itsNT=2\nitsAlphaSegment=[0,64) [64,128)\nitsBetaSegment =[63,0) [127,63)\n" +
                              pass("0", "1") + pass("1", "0"));
}

TEST(ParallelDecoder, TracesBoundariesBeforeTheyAreMasked) {
    Decoder decoder("MOD#:16", false, 8U, 4U);
    decoder.setVerbosity(9);
    std::vector<unsigned char> hard;
    std::istringstream trace(capture([&] { decoder.decode(randomSoft(3 * 2112 + 12, 11), hard, 3); }).out);
    const auto metrics = [](const std::string& text) {
        std::istringstream stream(text);
        std::vector<int> values;
        for (int value = 0; stream >> value;) {
            values.push_back(value);
        }
        EXPECT_EQ(values.size(), 8U);
        return values;
    };
    const std::regex alphaLine(R"(from=\d+ to=\d+ init=\[([-0-9 ]*)\] newinit=\[([-0-9 ]*)\])");
    const std::regex betaLine(
        R"(from=\d+ to=\d+ beta\[from\]=\[[-0-9 ]*\] beta\[to\]=\[([-0-9 ]*)\]( init\[(\d+)\]=([-0-9 ]*))?)");
    const std::regex entry(R"(\[([-0-9 ]+)\] )");
    std::vector<std::vector<int>> stored;
    int checked = 0;
    int unmasked = 0;
    for (std::string line; std::getline(trace, line);) {
        std::smatch match;
        if (std::regex_match(line, match, alphaLine)) {
            stored.push_back(metrics(match[2]));
        } else if (std::regex_match(line, match, betaLine)) {
            if (match[2].matched) {
                EXPECT_EQ(match[1], match[4]);
                stored.resize(std::max<std::size_t>(stored.size(), std::stoul(match[3]) + 1));
                stored[std::stoul(match[3])] = metrics(match[4]);
            }
        } else if (line.starts_with("itsAlphaInit") || line.starts_with("itsBetaInit")) {
            std::size_t i = 0;
            for (std::sregex_iterator it(line.begin() + 13, line.end(), entry), end; it != end; ++it, ++i) {
                if (i >= stored.size()) {
                    continue;  // the last window keeps its start from the tail
                }
                for (std::size_t state = 0; state < 8; ++state) {
                    const int kept = metrics((*it)[1])[state];
                    EXPECT_EQ(kept, stored[i][state] & -128);
                    ++checked;
                    unmasked += kept != stored[i][state] ? 1 : 0;
                }
            }
            stored.clear();
        }
    }
    // 6 passes, 32 segments and 64 windows each, of which the last window's start is not stored
    EXPECT_EQ(checked, 6 * (32 + 63) * 8);
    EXPECT_GT(unmasked, 0);
}

}  // namespace
}  // namespace quarzel::test
