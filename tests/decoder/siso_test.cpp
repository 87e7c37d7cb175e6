// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <numeric>

#include "decoder/decoder_3g.hpp"
#include "support/capture.hpp"
#include "support/decoder_setup.hpp"

namespace quarzel::test {
namespace {

using Decoder = OpenDecoder<TDecoder3G>;

/// Extrinsic value that a decoder with this scale makes of an LLR and an intrinsic value.
short extrinsicOf(double scale, short llr, short intrinsic) {
    Decoder decoder("MOD", false);
    decoder.setExtrinsicScale(scale);
    decoder.allocate(4);
    decoder.itsLLR.assign(4, llr);
    decoder.itsIntrinsic.assign(4, intrinsic);
    EXPECT_TRUE(decoder.calcExtrinsic(0));
    EXPECT_EQ(decoder.itsExtrinsic, std::vector<short>(4, decoder.itsExtrinsic[0]));
    return decoder.itsExtrinsic[0];
}

TEST(Siso, InitialStateIsKnownAndUnknownStateIsZero) {
    const Decoder decoder("MOD", false);
    T8 metrics = {{9, 9, 9, 9, 9, 9, 9, 9}};
    decoder.setInitialState(&metrics);
    EXPECT_TRUE(compareT8(metrics, T8{{0, -16384, -16384, -16384, -16384, -16384, -16384, -16384}}));
    Decoder::setUnknownState(&metrics);
    EXPECT_TRUE(compareT8(metrics, T8{}));
}

TEST(Siso, ExtrinsicIsTheLlrLessFourTimesTheIntrinsic) {
    EXPECT_EQ(extrinsicOf(1.0, 1000, 200), 200);
    EXPECT_EQ(extrinsicOf(1.0, -1000, 100), -1400);
}

TEST(Siso, ExtrinsicSaturatesToTheBranchFormatsRange) {
    for (const double scale : {1.0, 0.75, 0.5}) {
        EXPECT_EQ(extrinsicOf(scale, 32767, 0), 2032);
        EXPECT_EQ(extrinsicOf(scale, -32768, 0), -2048);
        EXPECT_EQ(extrinsicOf(scale, 32767, -32768), 2032);
    }
}

TEST(Siso, UnscaledExtrinsicKeepsTheLowBitsAndEveryScaledOneLosesThem) {
    EXPECT_EQ(extrinsicOf(1.0, 123, 0), 123);
    EXPECT_EQ(extrinsicOf(1.0, -1, 0), -1);
    EXPECT_EQ(extrinsicOf(0.75, 164, 0), 112);    // 123
    EXPECT_EQ(extrinsicOf(0.75, -164, 0), -128);  // -123
    EXPECT_EQ(extrinsicOf(0.5, 246, 0), 112);     // 123
}

/// A state format of 16 bits masks nothing, so that the plain quotients show.
short unmasked(double scale, short llr) {
    Decoder decoder("MOD", false);
    decoder.engine.state.reset(TNumberFormat::create("Fix_16_3"));
    decoder.engine.branch.reset(TNumberFormat::create("Fix_16_3"));
    decoder.engine.engine->setFormats(nullptr, decoder.engine.state.get(), decoder.engine.branch.get());
    decoder.setExtrinsicScale(scale);
    decoder.allocate(1);
    decoder.itsLLR[0] = llr;
    decoder.calcExtrinsic(0);
    return decoder.itsExtrinsic[0];
}

TEST(Siso, ScalesTruncateTowardZero) {
    EXPECT_EQ(unmasked(0.75, -1), 0);
    EXPECT_EQ(unmasked(0.75, -5), -3);
    EXPECT_EQ(unmasked(0.75, 5), 3);
    EXPECT_EQ(unmasked(0.5, -5), -2);
    EXPECT_EQ(unmasked(0.5, 5), 2);
    EXPECT_EQ(unmasked(-1.0, 5), -5);
}

TEST(Siso, ScalesThatLeaveTheIntegersSaturate) {
    EXPECT_EQ(unmasked(1e300, 1), 32767);
    EXPECT_EQ(unmasked(1e300, -1), -32768);
    EXPECT_EQ(unmasked(std::numeric_limits<double>::infinity(), 1), 32767);
    EXPECT_EQ(unmasked(std::numeric_limits<double>::quiet_NaN(), 1), -32768);
}

TEST(Siso, IntrinsicIsHalfOfChannelAndMaskedHalfExtrinsicInThePassesOrder) {
    constexpr unsigned K = 40;
    Decoder decoder("MOD", false);
    ASSERT_TRUE(decoder.extract(randomSoft(3 * K + 12, 5)));
    for (unsigned j = 0; j < K + 3; ++j) {
        decoder.itsExtrinsic[j] = static_cast<short>(static_cast<int>(j) * 37 - 700);
    }
    const std::vector<short> extrinsic = decoder.itsExtrinsic;
    std::vector<unsigned> permutation(K);
    std::vector<unsigned> inverse(K);
    for (unsigned i = 0; i < K; ++i) {
        permutation[i] = (3 * i + 10 * i * i) % K;
        inverse[permutation[i]] = i;
    }
    for (const unsigned siso : {0U, 1U, 2U, 7U}) {
        const unsigned set = siso % 2 == 0 ? 1 : 0;
        const auto& order = set == 1 ? permutation : inverse;
        ASSERT_TRUE(decoder.calcIntrinsic(siso));
        for (unsigned j = 0; j < K + 3; ++j) {
            const int a = j < K ? extrinsic[order[j]] : 0;
            const int expected = (decoder.itsSys[set][j] + ((a / 2) & -16)) / 2;
            EXPECT_EQ(decoder.itsIntrinsic[j], expected) << siso << " " << j;
        }
    }
}

TEST(Siso, BranchMetricsEndWithTheBlock) {
    Decoder decoder("MOD", false);
    ASSERT_TRUE(decoder.extract(randomSoft(3 * 40 + 12, 5)));
    T8* const behind = decoder.itsGamma + decoder.itsBlockSize;
    for (const unsigned siso : {0U, 1U}) {
        behind[-1] = behind[0] = behind[1] = T8{{1, 2, 3, 4, 5, 6, 7, 8}};
        ASSERT_TRUE(decoder.calcIntrinsic(siso) && decoder.calcGamma(siso));
        EXPECT_FALSE(compareT8(behind[-1], behind[0]));
        EXPECT_TRUE(compareT8(behind[0], T8{{1, 2, 3, 4, 5, 6, 7, 8}}));
        EXPECT_TRUE(compareT8(behind[0], behind[1]));
    }
}

TEST(Siso, WithoutIterationsEveryDecisionIs1) {
    Decoder decoder("MOD", false);
    std::vector<unsigned char> hard = {7};
    ASSERT_TRUE(decoder.decode(randomSoft(132, 1), hard, 0));
    EXPECT_EQ(hard, std::vector<unsigned char>(40, 1));
    EXPECT_EQ(decoder.decodeCount(), 1U);
    EXPECT_EQ(decoder.sisoCount(), 0U);
}

TEST(Siso, WithoutEntriesTheCountingDecodeRunsNoPass) {
    Decoder decoder("MOD", false);
    std::vector<unsigned long long> none;
    ASSERT_TRUE(decoder.decode(randomSoft(132, 1), std::vector<unsigned char>(40), none, none));
    EXPECT_EQ(decoder.decodeCount(), 1U);
    EXPECT_EQ(decoder.sisoCount(), 0U);
}

TEST(Siso, CountersGrowWithEveryBlock) {
    Decoder decoder("MOD", false);
    std::vector<unsigned char> hard;
    ASSERT_TRUE(decoder.decode(randomSoft(132, 1), hard, 3));
    ASSERT_TRUE(decoder.decode(randomSoft(132, 2), hard, 2));
    EXPECT_EQ(decoder.decodeCount(), 2U);
    EXPECT_EQ(decoder.sisoCount(), 10U);
    capture([&] { EXPECT_FALSE(decoder.decode(randomSoft(131, 1), hard, 2)); });
    EXPECT_EQ(decoder.decodeCount(), 2U);
}

TEST(Siso, AnLlrOf0DecidesOneAndIsAnErrorAgainstAZero) {
    Decoder decoder("MOD", false);
    const std::vector<short> zeros(132, 0);
    std::vector<unsigned long long> bitErrors(2, 0);
    std::vector<unsigned long long> blockErrors(2, 0);
    ASSERT_TRUE(decoder.decode(zeros, std::vector<unsigned char>(40, 0), bitErrors, blockErrors));
    EXPECT_EQ(bitErrors, (std::vector<unsigned long long>{40, 40}));
    EXPECT_EQ(blockErrors, (std::vector<unsigned long long>{1, 1}));
    ASSERT_TRUE(decoder.decode(zeros, std::vector<unsigned char>(42, 1), bitErrors, blockErrors));
    EXPECT_EQ(bitErrors, (std::vector<unsigned long long>{42, 42}));
    EXPECT_EQ(decoder.llr().size(), 43U);
}

TEST(Siso, CountsAfterEachIterationAreThoseOfAsManyIterations) {
    constexpr unsigned seed = 17;
    Decoder counting("MOD", false);
    Decoder deciding("MOD", false);
    const std::vector<short> soft = randomSoft(3 * 104 + 12, seed, 20);
    const std::vector<unsigned char> reference(104, 0);
    std::vector<unsigned long long> bitErrors(5, 0);
    std::vector<unsigned long long> blockErrors(5, 0);
    ASSERT_TRUE(counting.decode(soft, reference, bitErrors, blockErrors));
    for (unsigned i = 0; i < 5; ++i) {
        std::vector<unsigned char> hard;
        ASSERT_TRUE(deciding.decode(soft, hard, i + 1));
        EXPECT_EQ(bitErrors[i], static_cast<unsigned long long>(std::count(hard.begin(), hard.end(), 1)));
    }
}

TEST(Siso, SuppliedExtrinsicsAreMaskedAndUsedOnce) {
    const std::vector<short> soft = randomSoft(132, 3, 6);
    Decoder plain("MOD", false);
    Decoder supplied("MOD", false);
    std::vector<unsigned char> without;
    std::vector<unsigned char> with;
    ASSERT_TRUE(plain.decode(soft, without, 1));
    supplied.setExtrinsicIn(std::vector<short>(43, 2047));
    ASSERT_TRUE(supplied.decode(soft, with, 1));
    EXPECT_NE(supplied.llr(), plain.llr());
    ASSERT_TRUE(supplied.decode(soft, with, 1));
    EXPECT_EQ(supplied.llr(), plain.llr());
    // The bits below the format's precision do not count.
    supplied.setExtrinsicIn(std::vector<short>(43, 15));
    ASSERT_TRUE(supplied.decode(soft, with, 1));
    EXPECT_EQ(supplied.llr(), plain.llr());
}

TEST(Siso, SuppliedExtrinsicsMustCoverTheTermination) {
    Decoder decoder("MOD", false);
    decoder.setExtrinsicIn(std::vector<short>(40, 16));
    std::vector<unsigned char> hard = {7};
    const Output output = capture([&] { EXPECT_FALSE(decoder.decode(randomSoft(132, 3), hard, 1)); });
    EXPECT_EQ(output.err, "ERROR:TDecoder3G:Number of soft extrinsic inputs does not match block size\n");
    EXPECT_EQ(hard, std::vector<unsigned char>{7});
    EXPECT_EQ(decoder.decodeCount(), 0U);
}

TEST(Siso, TheCountingDecodeRefusesALengthThatDoesNotFit) {
    Decoder decoder("MOD", false);
    std::vector<unsigned long long> errors(1);
    const Output output =
        capture([&] { EXPECT_FALSE(decoder.decode(randomSoft(133, 3), {}, errors, errors)); });
    EXPECT_NE(output.err, "");
    EXPECT_EQ(errors[0], 0U);
}

TEST(Siso, APermutationThatGotLostIsComputedAgain) {
    Decoder decoder("MOD", false);
    ASSERT_TRUE(decoder.extract(randomSoft(132, 3)));
    std::iota(decoder.itsExtrinsic.begin(), decoder.itsExtrinsic.end(), short{0});
    decoder.calcIntrinsic(0);
    const std::vector<short> expected = decoder.intrinsic();
    decoder.interleaver->itsPermutation.clear();
    decoder.calcIntrinsic(0);
    EXPECT_EQ(decoder.intrinsic(), expected);
    EXPECT_EQ(decoder.interleaver->itsPermutation.size(), 40U);
}

/// A decoder whose operations fail.
struct Broken : TDecoder3G {
    using TDecoder3G::TDecoder3G;
    unsigned failAt = 99;
    unsigned calls = 0;
    bool next() { return ++calls != failAt; }
    bool calcIntrinsic(unsigned) override { return next(); }
    bool calcGamma(unsigned) override { return next(); }
    bool calcAlpha(unsigned) override { return next(); }
    bool calcBeta(unsigned) override { return next(); }
    bool calcLLR(unsigned) override { return next(); }
    bool calcExtrinsic(unsigned) override { return next(); }
};

TEST(Siso, TheFirstOperationThatFailsEndsTheDecode) {
    for (unsigned failAt = 1; failAt <= 12; ++failAt) {
        OpenDecoder<Broken> decoder("MOD", false);
        decoder.failAt = failAt;
        std::vector<unsigned char> hard;
        EXPECT_FALSE(decoder.decode(randomSoft(132, 1), hard, 3));
        EXPECT_EQ(decoder.calls, failAt);
        EXPECT_EQ(decoder.sisoCount(), 0U);
        decoder.calls = 0;
        std::vector<unsigned long long> errors(3);
        EXPECT_FALSE(decoder.decode(randomSoft(132, 1), {}, errors, errors));
        EXPECT_EQ(decoder.calls, failAt);
        EXPECT_EQ(decoder.sisoCount(), 0U);
    }
}

}  // namespace
}  // namespace quarzel::test
