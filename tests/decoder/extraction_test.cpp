// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <numeric>

#include "decoder/decoder_3gpu.hpp"
#include "support/capture.hpp"
#include "support/decoder_setup.hpp"

namespace quarzel::test {
namespace {

using Stream = std::vector<short>;

constexpr const char* wrongLength =
    "ERROR:TDecoder3G:Number of soft inputs does not match rate and number of tail bits\n";

/// Values that tell their position: i-th value is i, the first one the most negative word.
std::vector<short> counting(std::size_t size) {
    std::vector<short> soft(size);
    std::iota(soft.begin(), soft.end(), short{0});
    soft[0] = -32768;
    return soft;
}

TEST(Extraction, TakesThe3GPPLayoutApart) {
    constexpr unsigned K = 40;
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    const std::vector<short> soft = counting(3 * K + 12);
    ASSERT_TRUE(decoder.extract(soft));
    EXPECT_EQ(decoder.itsBlockSize, K + 3);
    for (unsigned i = 0; i < K; ++i) {
        EXPECT_EQ(decoder.itsSys[0][i], soft[3 * i]);
        EXPECT_EQ(decoder.itsPar0[0][i], soft[3 * i + 1]);
        EXPECT_EQ(decoder.itsPar0[1][i], soft[3 * i + 2]);
        EXPECT_EQ(decoder.itsSys[1][i], soft[3 * ((3 * i + 10 * i * i) % K)]);
    }
    const auto tail = [](const Stream& stream) { return Stream(stream.end() - 3, stream.end()); };
    EXPECT_EQ(tail(decoder.itsSys[0]), (Stream{120, 122, 124}));
    EXPECT_EQ(tail(decoder.itsPar0[0]), (Stream{121, 123, 125}));
    EXPECT_EQ(tail(decoder.itsSys[1]), (Stream{126, 128, 130}));
    EXPECT_EQ(tail(decoder.itsPar0[1]), (Stream{127, 129, 131}));
    for (const auto* streams : {&decoder.itsSys, &decoder.itsPar0, &decoder.itsPar1}) {
        EXPECT_EQ((*streams)[0].size(), K + 3);
        EXPECT_EQ((*streams)[1].size(), K + 3);
    }
    EXPECT_EQ(decoder.itsPar1[0], Stream(K + 3, 0));
    EXPECT_EQ(decoder.itsPar1[1], Stream(K + 3, 0));
}

TEST(Extraction, TakesThe3GPP2LayoutApart) {
    constexpr unsigned K = 40;
    OpenDecoder<TDecoder3G> decoder("MOD", true);
    const std::vector<short> soft = counting(5 * K + 18);
    ASSERT_TRUE(decoder.extract(soft));
    for (unsigned i = 0; i < K; ++i) {
        EXPECT_EQ(decoder.itsSys[0][i], soft[5 * i]);
        EXPECT_EQ(decoder.itsPar0[0][i], soft[5 * i + 1]);
        EXPECT_EQ(decoder.itsPar1[0][i], soft[5 * i + 2]);
        EXPECT_EQ(decoder.itsPar0[1][i], soft[5 * i + 3]);
        EXPECT_EQ(decoder.itsPar1[1][i], soft[5 * i + 4]);
        EXPECT_EQ(decoder.itsSys[1][i], soft[5 * ((3 * i + 10 * i * i) % K)]);
    }
    for (unsigned code = 0; code < 2; ++code) {
        for (unsigned r = 0; r < 3; ++r) {
            const unsigned base = 5 * K + 9 * code + 3 * r;
            EXPECT_EQ(decoder.itsSys[code][K + r], soft[base]);
            EXPECT_EQ(decoder.itsPar0[code][K + r], soft[base + 1]);
            EXPECT_EQ(decoder.itsPar1[code][K + r], soft[base + 2]);
        }
    }
}

TEST(Extraction, RefusesLengthsThatDoNotFitAndKeepsWhatItHas) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    ASSERT_TRUE(decoder.extract(counting(132)));
    const Stream before = decoder.itsSys[1];
    for (const std::size_t length : {131U, 133U, 134U, 11U, 8U, 0U, 1U}) {
        std::vector<short> soft(length);
        EXPECT_EQ(capture([&] { EXPECT_FALSE(decoder.extract(soft)); }).err, wrongLength) << length;
        EXPECT_EQ(decoder.itsSys[1], before);
        EXPECT_EQ(decoder.itsBlockSize, 43U);
    }
}

TEST(Extraction, ADecoderOfTheOtherLayoutRefusesA3GPPLength) {
    OpenDecoder<TDecoder3G> decoder("MOD", true);
    for (const std::size_t length : {132U, 217U, 219U, 17U, 13U}) {
        EXPECT_EQ(capture([&] { EXPECT_FALSE(decoder.extract(std::vector<short>(length))); }).err,
                  wrongLength);
    }
}

TEST(Extraction, ABlockOfTailsAloneHasNoInterleavedValues) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    ASSERT_TRUE(decoder.extract(counting(132)));
    const std::vector<short> soft = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12};
    const Output output = capture([&] { EXPECT_TRUE(decoder.extract(soft)); });
    EXPECT_EQ(output.err, "");
    EXPECT_EQ(decoder.itsSys[0], (Stream{1, 3, 5}));
    EXPECT_EQ(decoder.itsPar0[0], (Stream{2, 4, 6}));
    EXPECT_EQ(decoder.itsSys[1], (Stream{7, 9, 11}));
    EXPECT_EQ(decoder.itsPar0[1], (Stream{8, 10, 12}));
}

TEST(Extraction, RefusesSizesThatTheInterleaverLacksEachTime) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    for (int round = 0; round < 2; ++round) {
        EXPECT_EQ(capture([&] { EXPECT_FALSE(decoder.extract(std::vector<short>(3 * 520 + 12))); }).err,
                  "ERROR:TDecoder3G:The interleaver has no block size of 520 bits\n");
    }
}

TEST(Extraction, CachedPermutationOfAnotherSizeIsReplaced) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    ASSERT_TRUE(decoder.extract(counting(3 * 48 + 12)));
    ASSERT_TRUE(decoder.extract(counting(3 * 40 + 12)));
    EXPECT_EQ(decoder.interleaver->itsPermutation.size(), 40U);
    EXPECT_EQ(decoder.itsSys[1][1], 3 * 13);
}

TEST(Extraction, DumpsTheStreamsWhileADumpIsPending) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    decoder.setDump(1);
    std::vector<short> soft = {-1, 2, 3, 4, 5, 6, 7, 8, 9, -10, 11, 12};
    const Output output = capture([&] { EXPECT_TRUE(decoder.extract(soft)); });
    EXPECT_EQ(output.out, std::string(120, '-') + "\n" +
                              "itsSys [0]=[-1 3 5]\n"
                              "itsPar0[0]=[2 4 6]\n"
                              "itsPar1[0]=[0 0 0]\n"
                              "itsSys [1]=[7 9 11]\n"
                              "itsPar0[1]=[8 -10 12]\n"
                              "itsPar1[1]=[0 0 0]\n");
    decoder.setDump(0);
    EXPECT_EQ(capture([&] { decoder.extract(soft); }).out, "");
}

}  // namespace
}  // namespace quarzel::test
