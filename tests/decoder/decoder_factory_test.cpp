// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>

#include "decoder/decoder_3gpu.hpp"
#include "support/capture.hpp"
#include "support/decoder_setup.hpp"

namespace quarzel::test {
namespace {

std::unique_ptr<TDecoder> create(const std::string& properties) {
    return std::unique_ptr<TDecoder>(TDecoder::create(properties));
}

TEST(DecoderFactory, KnowsTheParallelDecoderOnly) {
    EXPECT_EQ(TDecoder::getNames(), std::vector<std::string>{"3GPPPU"});
    auto names = TDecoder::getNames();
    names.clear();
    EXPECT_EQ(TDecoder::getNames().size(), 1U);
    for (const std::string type : {"3GPP", "3GPP2", "3GPP2PU", "3gpppu", "3GPPPU ", ""}) {
        const Output output = capture([&] { EXPECT_EQ(create(type + ":2"), nullptr); });
        EXPECT_EQ(output.err, "ERROR:TDecoder:Unrecognised type:" + type + "\n");
    }
}

TEST(DecoderFactory, PropertiesGiveUnitsAndThreads) {
    const struct {
        const char* given;
        const char* back;
    } cases[] = {{"3GPPPU", "3GPPPU:4"},     {"3GPPPU:", "3GPPPU:4"},      {"3GPPPU:2", "3GPPPU:2"},
                 {"3GPPPU:8", "3GPPPU:8"},   {"3GPPPU:2,3", "3GPPPU:2,3"}, {"3GPPPU:2,4", "3GPPPU:2"},
                 {"3GPPPU:5x", "3GPPPU:5"},  {"3GPPPU:5 ,9", "3GPPPU:5"},  {"3GPPPU: 6", "3GPPPU:6"},
                 {"3GPPPU:6:7", "3GPPPU:6"}, {"3GPPPU:1,1z", "3GPPPU:1,1"}};
    for (const auto& [given, back] : cases) {
        const auto decoder = create(given);
        ASSERT_NE(decoder, nullptr) << given;
        EXPECT_EQ(decoder->getProperties(), back) << given;
        EXPECT_EQ(create(back)->getProperties(), back);
    }
}

TEST(DecoderFactory, IllegalCountsAreRefused) {
    const struct {
        const char* given;
        const char* error;
    } cases[] = {{"3GPPPU:0", "ERROR:TDecoder3GPU:Illegal number of processing units:0\n"},
                 {"3GPPPU:x", "ERROR:TDecoder3GPU:Illegal number of processing units:0\n"},
                 {"3GPPPU: ", "ERROR:TDecoder3GPU:Illegal number of processing units:4\n"},
                 {"3GPPPU:99999999999", "ERROR:TDecoder3GPU:Illegal number of processing units:4294967295\n"},
                 {"3GPPPU:4,0", "ERROR:TDecoder3GPU:Illegal number of threads per processing unit:0\n"},
                 {"3GPPPU:4,", "ERROR:TDecoder3GPU:Illegal number of threads per processing unit:4\n"},
                 {"3GPPPU:4,x", "ERROR:TDecoder3GPU:Illegal number of threads per processing unit:0\n"}};
    for (const auto& refused : cases) {
        const Output output = capture([&] { EXPECT_EQ(create(refused.given), nullptr); });
        EXPECT_EQ(output.err, refused.error) << refused.given;
    }
}

TEST(DecoderFactory, TheSingleUnitDecoderHasItsOwn) {
    EXPECT_EQ(std::unique_ptr<TDecoder>(TDecoder3G::create(false, ""))->getProperties(), "3GPP");
    EXPECT_EQ(std::unique_ptr<TDecoder>(TDecoder3G::create(true, ""))->getProperties(), "3GPP2");
    const Output output = capture([] { EXPECT_EQ(TDecoder3G::create(false, "x"), nullptr); });
    EXPECT_EQ(output.err, "ERROR:TDecoder3G:Unexpected properties x\n");
}

TEST(DecoderFactory, AParallelDecoderOfTheOtherLayoutSaysSo) {
    EXPECT_EQ(std::unique_ptr<TDecoder>(TDecoder3GPU::create(true, "2,5"))->getProperties(), "3GPP2PU:2,5");
}

TEST(Decoder, StartsEmpty) {
    const OpenDecoder<TDecoder3G> decoder("MOD", false);
    EXPECT_EQ(decoder.extrinsicScale(), 1.0);
    EXPECT_EQ(decoder.decodeCount(), 0U);
    EXPECT_EQ(decoder.sisoCount(), 0U);
    EXPECT_EQ(decoder.metricBufferSize(), 0U);
    EXPECT_TRUE(decoder.alpha().empty());
    EXPECT_TRUE(decoder.llr().empty());
}

TEST(Decoder, MetricStoreGrowsInStepsOf64AndNeverShrinks) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    EXPECT_TRUE(decoder.allocate(1));
    EXPECT_EQ(decoder.metricBufferSize(), 48U * 64 + 16);
    const T8* alpha = decoder.itsAlpha;
    EXPECT_TRUE(decoder.allocate(64));
    EXPECT_EQ(decoder.itsAlpha, alpha);
    EXPECT_EQ(decoder.metricBufferSize(), 48U * 64 + 16);
    EXPECT_TRUE(decoder.allocate(65));
    EXPECT_EQ(decoder.metricBufferSize(), 48U * 128 + 16);
    EXPECT_EQ(decoder.itsBeta - decoder.itsAlpha, 128);
    EXPECT_EQ(decoder.itsGamma - decoder.itsBeta, 128);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(decoder.itsAlpha) % 16, 0U);
    EXPECT_TRUE(decoder.allocate(3));
    EXPECT_EQ(decoder.metricBufferSize(), 48U * 128 + 16);
    EXPECT_EQ(decoder.itsBeta - decoder.itsAlpha, 128);
}

TEST(Decoder, ANewMetricStoreIsZeroAndAnOldOneIsKept) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    decoder.allocate(64);
    const auto isZero = [](const T8& metrics) { return compareT8(metrics, T8{}); };
    EXPECT_TRUE(std::all_of(decoder.itsAlpha, decoder.itsAlpha + 3 * 64, isZero));
    decoder.itsGamma[63][7] = 5;
    decoder.allocate(10);
    EXPECT_EQ(decoder.itsGamma[63][7], 5);
    decoder.allocate(200);
    EXPECT_TRUE(std::all_of(decoder.itsAlpha, decoder.itsAlpha + 3 * 256, isZero));
}

TEST(Decoder, VectorsAreClearedForEveryBlock) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    decoder.allocate(43);
    decoder.itsLLR[42] = decoder.itsExtrinsic[0] = decoder.itsIntrinsic[5] = 9;
    decoder.itsSys[1].push_back(3);
    decoder.allocate(44);
    EXPECT_EQ(decoder.itsLLR, std::vector<short>(44, 0));
    EXPECT_EQ(decoder.itsExtrinsic, std::vector<short>(44, 0));
    EXPECT_EQ(decoder.itsIntrinsic, std::vector<short>(44, 0));
    EXPECT_TRUE(decoder.itsSys[1].empty());
    EXPECT_GE(decoder.itsPar1[1].capacity(), 44U);
}

/// Decides what it is told to.
struct Decided : OpenDecoder<TDecoder3G> {
    using OpenDecoder::OpenDecoder;
    std::vector<unsigned char> bits;
    unsigned iterationsAsked = 0;
    bool good = true;
    bool decode(const std::vector<short>&, std::vector<unsigned char>& hard, unsigned iterations) override {
        hard = bits;
        iterationsAsked = iterations;
        return good;
    }
    bool count(const std::vector<unsigned char>& reference, std::vector<unsigned long long>& bitErrors,
               std::vector<unsigned long long>& blockErrors) {
        return TDecoder::decode({}, reference, bitErrors, blockErrors);
    }
};

TEST(Decoder, BaseCountsErrorsInTheLastEntriesWithSurplusOnEitherSide) {
    Decided decoder("MOD", false);
    decoder.bits = {1, 0, 1, 1, 0};
    const struct {
        std::vector<unsigned char> reference;
        unsigned long long errors;
    } cases[] = {
        {{1, 0, 1, 1, 0}, 0},      {{7, 0, 255, 1, 0}, 0}, {{0, 1, 1, 1, 0}, 2}, {{1, 0, 1}, 2}, {{}, 5},
        {{1, 0, 1, 1, 0, 0, 0}, 2}};
    for (const auto& [reference, errors] : cases) {
        std::vector<unsigned long long> bitErrors = {100, 200, 300};
        std::vector<unsigned long long> blockErrors = {10, 20};
        EXPECT_TRUE(decoder.count(reference, bitErrors, blockErrors));
        EXPECT_EQ(decoder.iterationsAsked, 3U);
        EXPECT_EQ(bitErrors, (std::vector<unsigned long long>{100, 200, 300 + errors}));
        EXPECT_EQ(blockErrors, (std::vector<unsigned long long>{10, 20U + (errors != 0 ? 1 : 0)}));
    }
    decoder.good = false;
    std::vector<unsigned long long> bitErrors = {1};
    std::vector<unsigned long long> blockErrors = {1};
    EXPECT_FALSE(decoder.count({0}, bitErrors, blockErrors));
    EXPECT_EQ(bitErrors[0] + blockErrors[0], 2U);
}

}  // namespace
}  // namespace quarzel::test
