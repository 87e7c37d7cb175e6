// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <sstream>

#include "decoder/decoder_3gpu.hpp"
#include "support/capture.hpp"
#include "support/decoder_setup.hpp"

namespace quarzel::test {
namespace {

using Decoder = OpenDecoder<TDecoder3GPU>;

const std::string header =
    "n    int           a0          a1          a2          a3          a4          a5          a6          "
    "a7            b0          b1          b2          b3          b4          b5          b6          b7    "
    "  "
    "      g4          g5          g6          g7            llr         ext\n";

std::string tableHead(int decode, int siso) {
    return std::string(289, '-') + "\ndecode=" + std::to_string(decode) + " siso=" + std::to_string(siso) +
           "\n" + header;
}

int count(const std::string& text, const std::string& what) {
    int found = 0;
    for (std::size_t at = text.find(what); at != std::string::npos; at = text.find(what, at + 1)) {
        ++found;
    }
    return found;
}

TEST(DecoderDump, ARowShowsEveryValueOfAStep) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    decoder.allocate(2);
    decoder.itsIntrinsic[0] = 64;
    decoder.itsAlpha[0] = T8{{0, -32768, 16, -16, 32767, 160, 8, -8}};
    decoder.itsBeta[0] = T8{{128, 256, 384, 512, 640, 768, 896, 1024}};
    decoder.itsGamma[0] = T8{{16, 32, 48, 64, 9, 9, 9, 9}};
    decoder.itsLLR[0] = -4096;
    decoder.itsExtrinsic[0] = 2032;
    std::ostringstream stream;
    decoder.dumpFull(stream, 7);
    const std::string zero = "+0.000000   ";
    std::string zeros8;
    for (int i = 0; i < 8; ++i) {
        zeros8 += zero;
    }
    EXPECT_EQ(
        stream.str(),
        tableHead(0, 7) +
            "0    +0.500000     +0.000000   -256.000000 +0.125000   -0.125000   +255.875000 +1.250000   "
            "+0.000000   -0.125000     +1.000000   +2.000000   +3.000000   +4.000000   +5.000000   "
            "+6.000000   +7.000000   +8.000000     +0.375000   +0.250000   +0.500000   +0.125000     "
            "-32.000000  +15.875000  \n" +
            "1    " + zero + "  " + zeros8 + "  " + zeros8 + "  " + zero + zero + zero + zero + "  " + zero +
            zero + "\n");
}

TEST(DecoderDump, ABlockWithoutStepsHasNoRows) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    decoder.allocate(0);
    std::ostringstream stream;
    decoder.dumpFull(stream, 0);
    EXPECT_EQ(stream.str(), tableHead(0, 0));
}

TEST(DecoderDump, SettingsOfTheStreamNeitherMatterNorChange) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    decoder.allocate(12);
    std::ostringstream plain;
    decoder.dumpFull(plain, 10);
    std::ostringstream odd;
    odd << std::hex << std::showbase << std::scientific;
    odd.width(9);
    odd.fill('#');
    const auto flags = odd.flags();
    decoder.dumpFull(odd, 10);
    EXPECT_EQ(odd.str(), plain.str());
    EXPECT_EQ(odd.flags(), flags);
    EXPECT_EQ(odd.width(), 9);
    EXPECT_EQ(odd.fill(), '#');
}

TEST(DecoderDump, CountsPassesAcrossBlocksAndInputsPerBlock) {
    Decoder decoder("MOD", false, 2U, 4U);
    std::vector<unsigned char> hard;
    decoder.setDump(5);
    const auto decode = [&] {
        return capture([&] { EXPECT_TRUE(decoder.decode(randomSoft(132, 2), hard, 2)); });
    };
    const std::string first = decode().out;
    EXPECT_EQ(count(first, "itsSys [0]=["), 1);
    for (int siso = 0; siso < 4; ++siso) {
        EXPECT_EQ(count(first, tableHead(0, siso)), 1) << siso;
    }
    const std::string second = decode().out;
    EXPECT_EQ(count(second, "itsSys [0]=["), 1);
    EXPECT_EQ(count(second, "siso="), 1);
    EXPECT_EQ(count(second, tableHead(1, 0)), 1);
    EXPECT_EQ(decode().out, "");
}

TEST(DecoderDump, StopEndsTheDecodeAfterTheLastRequestedPass) {
    Decoder decoder("MOD", false, 2U, 4U);
    std::vector<unsigned char> hard = {7};
    decoder.setDump(3, true);
    Output output = capture([&] { EXPECT_FALSE(decoder.decode(randomSoft(132, 2), hard, 6)); });
    EXPECT_EQ(output.err, "STOP:Dump complete\n");
    EXPECT_EQ(count(output.out, "itsSys [0]=["), 1);
    EXPECT_EQ(count(output.out, "siso="), 3);
    EXPECT_EQ(count(output.out, tableHead(0, 2)), 1);
    EXPECT_EQ(hard, std::vector<unsigned char>{7});
    EXPECT_EQ(decoder.sisoCount(), 0U);
    // The stop setting alone stops nothing.
    output = capture([&] { EXPECT_TRUE(decoder.decode(randomSoft(132, 2), hard, 6)); });
    EXPECT_EQ(output.out + output.err, "");
}

TEST(DecoderDump, WithoutStopDecodingGoesOn) {
    Decoder traced("MOD", false, 2U, 4U);
    Decoder silent("MOD", false, 2U, 4U);
    std::vector<unsigned char> a;
    std::vector<unsigned char> b;
    traced.setDump(3);
    const Output output = capture([&] { EXPECT_TRUE(traced.decode(randomSoft(132, 9), a, 4)); });
    EXPECT_TRUE(silent.decode(randomSoft(132, 9), b, 4));
    EXPECT_EQ(count(output.out, "siso="), 3);
    EXPECT_EQ(a, b);
}

TEST(DecoderDump, TheShortDumpIsEmpty) {
    Decoder decoder("MOD", false, 2U, 4U);
    std::ostringstream stream;
    decoder.dump(stream);
    EXPECT_EQ(stream.str(), "");
}

}  // namespace
}  // namespace quarzel::test
