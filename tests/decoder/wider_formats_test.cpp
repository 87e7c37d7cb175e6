// SPDX-License-Identifier: MIT
// Why too large soft values lose blocks: branch metrics and extrinsic values clip.
#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <vector>

#include "decoder/decoder_3gpu.hpp"
#include "interface/wiring.hpp"
#include "interleaver/interleaver.hpp"
#include "link/encoder.hpp"
#include "quarzel/quantise.hpp"
#include "support/engine_setup.hpp"

namespace quarzel::test {
namespace {

constexpr std::uint32_t blockSize = 1024;
constexpr int blocks = 400;
constexpr unsigned iterations = 8;

/// A core with 2 units and a format of its own for branch metrics and extrinsic values.
class Decoder {
  public:
    Decoder(int algorithm, const char* branchFormat)
        : itsEngine(engineProperties(algorithm), stateFormatProperties, branchFormat) {
        itsDecoder.connect(itsInterleaver.get(), itsEngine.engine.get());
        itsDecoder.setExtrinsicScale(extrinsicScale(algorithm));
    }

    bool fails(const std::vector<short>& soft, const std::vector<std::uint8_t>& sent) {
        std::vector<unsigned char> decided;
        EXPECT_TRUE(itsDecoder.decode(soft, decided, iterations));
        return decided != sent;
    }

  private:
    EngineSetup itsEngine;
    std::unique_ptr<TInterleaver> itsInterleaver{TInterleaver::create("3GPPLTE")};
    TDecoder3GPU itsDecoder{false, 2, TDecoder3GPU::defaultThreads};
};

/// Blocks with noise, quantised with a factor.
class Link {
  public:
    Link(double ebN0, double factor) : itsVariance(1.5 / std::pow(10, ebN0 / 10)), itsFactor(factor) {}

    const std::vector<std::uint8_t>& sent() const { return itsSent; }

    /// The soft values of another block as the decoder takes them, words of the state format.
    std::vector<short> next() {
        std::generate(itsSent.begin(), itsSent.end(), [this] { return itsRandom() >> 31; });
        std::vector<std::uint8_t> code(3 * itsEncoder.positions());
        itsEncoder.encode(itsSent.data(), code.data());
        std::vector<double> ratios(code.size());
        std::transform(code.begin(), code.end(), ratios.begin(), [this](std::uint8_t bit) {
            const double sample = (bit != 0 ? 1 : -1) + std::sqrt(itsVariance) * itsNoise(itsRandom);
            return 2 / itsVariance * sample;
        });
        std::vector<std::int8_t> quantised(ratios.size());
        quantise(ratios, quantised, itsFactor);
        std::vector<short> soft;
        for (std::size_t position = 0; position < itsEncoder.positions(); ++position) {
            for (std::size_t stream = 0; stream < 3; ++stream) {
                soft.push_back(
                    static_cast<short>(quantised[stream * itsEncoder.positions() + position] * 16));
            }
        }
        return soft;
    }

  private:
    double itsVariance;
    double itsFactor;
    std::mt19937 itsRandom{1};
    std::normal_distribution<double> itsNoise;
    link::Encoder itsEncoder{blockSize};
    std::vector<std::uint8_t> itsSent = std::vector<std::uint8_t>(blockSize);
};

TEST(WiderFormats, AreAllThatAFactorOf16Lacks) {
    for (const auto& [algorithm, ebN0] : {std::pair{0, 1.5}, std::pair{1, 1.2}, std::pair{2, 1.15}}) {
        Decoder asTheCoreIs(algorithm, branchFormatProperties);
        Decoder oneBitMore(algorithm, "Fix_9_3");
        Link link(ebN0, 16);
        int lost = 0;
        int lostWithOneBitMore = 0;
        for (int block = 0; block < blocks; ++block) {
            const std::vector<short> soft = link.next();
            lost += asTheCoreIs.fails(soft, link.sent()) ? 1 : 0;
            lostWithOneBitMore += oneBitMore.fails(soft, link.sent()) ? 1 : 0;
        }
        std::cout << "type " << algorithm << ": " << lost << " of " << blocks << " blocks lost, "
                  << lostWithOneBitMore << " with one bit more\n";
        EXPECT_GT(lost, 5) << "type " << algorithm;
        EXPECT_LT(5 * lostWithOneBitMore, lost) << "type " << algorithm;
    }
}

}  // namespace
}  // namespace quarzel::test
