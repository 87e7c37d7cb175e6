// SPDX-License-Identifier: MIT
// Block error rates of decoders that are not the core, and of the core with parts of it changed, all on the
// same noise: what docs/validation.md explains differences with. Prints CSV, a row for each Eb/N0, of the
// form that 'quarzel plot' takes as a reference.
#include <CLI/CLI.hpp>
#include <bit>
#include <cmath>
#include <functional>
#include <iostream>
#include <memory>
#include <random>
#include <stdexcept>

#include "bench/validation/float_decoder.hpp"
#include "decoder/decoder_3g.hpp"
#include "interface/wiring.hpp"
#include "interleaver/interleaver.hpp"
#include "link/encoder.hpp"
#include "quarzel/core.hpp"
#include "support/engine_setup.hpp"

namespace quarzel::validation {
namespace {

constexpr std::size_t lanes = FloatDecoder::lanes;

struct Options {
    std::uint32_t blockSize = 1024;
    unsigned iterations = 8;
    std::vector<double> ebN0;
    std::string decoder = "float";
    std::vector<float> scales = {1};
    std::size_t segments = 1;
    int units = 2;
    int algorithm = 0;
    double factor = 4;
    bool isRayleigh = false;
    std::uint64_t maxBlocks = 100000;
    std::uint64_t maxBlockErrors = 500;
    std::uint64_t seed = 1;
    std::string label;
};

/// Decides some blocks: 3 (K + 4) ratios each in, K decisions out, a bit for each block.
using Decoder = std::function<void(std::span<const FloatDecoder::Values>, std::span<std::uint16_t>)>;

short softOf(float ratio, double factor) {
    return static_cast<short>(std::clamp(std::nearbyint(ratio * factor), -128.0, 127.0));
}

Decoder floatDecoder(const Options& options) {
    auto decoder = std::make_shared<FloatDecoder>(
        options.blockSize,
        FloatSettings{options.decoder == "float-log-map", options.scales, options.segments});
    return
        [decoder, options](auto streams, auto bits) { decoder->decode(streams, options.iterations, bits); };
}

Decoder core(const Options& options) {
    auto core = std::make_shared<Core>(CoreSettings{options.units, options.algorithm});
    return [core, options](auto streams, auto bits) {
        std::vector<std::int8_t> soft(lanes * streams.size());
        for (std::size_t lane = 0; lane < lanes; ++lane) {
            for (std::size_t i = 0; i < streams.size(); ++i) {
                soft[lane * streams.size() + i] =
                    static_cast<std::int8_t>(softOf(streams[i][lane], options.factor));
            }
        }
        std::vector<unsigned char> decided(lanes * bits.size());
        core->decode(softBlocks<std::int8_t>(soft, streams.size() / 3), static_cast<int>(options.iterations),
                     decided);
        std::fill(bits.begin(), bits.end(), 0);
        for (std::size_t lane = 0; lane < lanes; ++lane) {
            for (std::size_t k = 0; k < bits.size(); ++k) {
                bits[k] = static_cast<std::uint16_t>(bits[k] | decided[lane * bits.size() + k] << lane);
            }
        }
    };
}

/// The core's arithmetic in one thread segment, by the component classes.
Decoder oneSegment(const Options& options) {
    struct Classes {
        explicit Classes(int algorithm) : engine(engineProperties(algorithm)) {}

        test::EngineSetup engine;
        std::unique_ptr<TInterleaver> interleaver{TInterleaver::create("3GPPLTE")};
        TDecoder3G decoder{false};
    };
    auto classes = std::make_shared<Classes>(options.algorithm);
    classes->decoder.connect(classes->interleaver.get(), classes->engine.engine.get());
    classes->decoder.setExtrinsicScale(extrinsicScale(options.algorithm));
    return [classes, options](auto streams, auto bits) {
        const std::size_t K = bits.size();
        std::fill(bits.begin(), bits.end(), 0);
        for (std::size_t lane = 0; lane < lanes; ++lane) {
            const auto at = [&](std::size_t stream, std::size_t position) {
                return static_cast<short>(16 *
                                          softOf(streams[stream * (K + 4) + position][lane], options.factor));
            };
            std::vector<short> soft;
            for (std::size_t k = 0; k < K; ++k) {
                soft.insert(soft.end(), {at(0, k), at(1, k), at(2, k)});
            }
            // The streams' tails are those of code 1 and then of code 2, systematic and parity in turns, in
            // columns.
            for (std::size_t i = 0; i < 12; ++i) {
                soft.push_back(at(i % 3, K + i / 3));
            }
            std::vector<unsigned char> decided;
            if (!classes->decoder.decode(soft, decided, options.iterations)) {
                throw std::runtime_error("the component classes refuse a block");
            }
            for (std::size_t k = 0; k < K; ++k) {
                bits[k] = static_cast<std::uint16_t>(bits[k] | decided[k] << lane);
            }
        }
    };
}

Decoder decoderOf(const Options& options) {
    if (options.decoder == "core") {
        return core(options);
    }
    return options.decoder == "one-segment" ? oneSegment(options) : floatDecoder(options);
}

/// Blocks of random bits, sent as -1 and +1 with noise, over fading amplitudes that the receiver knows if
/// wanted.
class Link {
  public:
    Link(const Options& options, double ebN0)
        : itsEncoder(options.blockSize),
          itsIsRayleigh(options.isRayleigh),
          itsRandom(options.seed),
          itsDeviation(std::sqrt(1.5 / std::pow(10, ebN0 / 10))) {}

    /// @param bits     receives K information bits, bit i of each from block i
    /// @param streams  receives 3 (K + 4) log-likelihood ratios
    void send(std::span<std::uint16_t> bits, std::span<FloatDecoder::Values> streams) {
        std::vector<std::uint8_t> half(bits.size());
        std::vector<std::uint8_t> code(streams.size());
        for (std::uint16_t& bit : bits) {
            bit = static_cast<std::uint16_t>(itsRandom());
        }
        for (std::size_t first = 0; first < lanes; first += 8) {
            for (std::size_t k = 0; k < bits.size(); ++k) {
                half[k] = static_cast<std::uint8_t>(bits[k] >> first);
            }
            itsEncoder.encode(half.data(), code.data());
            for (std::size_t i = 0; i < streams.size(); ++i) {
                for (std::size_t lane = 0; lane < 8; ++lane) {
                    streams[i][first + lane] = receive((code[i] >> lane & 1) != 0);
                }
            }
        }
    }

  private:
    float receive(bool bit) {
        // The mean energy of a fading amplitude is 1.
        const double amplitude =
            itsIsRayleigh ? std::hypot(itsNormal(itsRandom), itsNormal(itsRandom)) / std::sqrt(2) : 1;
        const double received = (bit ? amplitude : -amplitude) + itsDeviation * itsNormal(itsRandom);
        return static_cast<float>(2 * amplitude * received / (itsDeviation * itsDeviation));
    }

    link::Encoder itsEncoder;
    bool itsIsRayleigh;
    std::mt19937_64 itsRandom;
    std::normal_distribution<double> itsNormal;
    double itsDeviation;
};

void simulate(const Options& options) {
    const Decoder decode = decoderOf(options);
    const std::size_t K = options.blockSize;
    std::vector<std::uint16_t> bits(K);
    std::vector<std::uint16_t> decided(K);
    std::vector<FloatDecoder::Values> streams(3 * (K + 4));
    std::cout << "source,K,code_bits,channel,modulation,decoder,iterations,ebn0_db,blocks,bit_errors,block_"
                 "errors\n";
    for (const double ebN0 : options.ebN0) {
        Link link(options, ebN0);
        std::uint64_t blocks = 0;
        std::uint64_t bitErrors = 0;
        std::uint64_t blockErrors = 0;
        while (blocks < options.maxBlocks && blockErrors < options.maxBlockErrors) {
            link.send(bits, streams);
            decode(streams, decided);
            unsigned wrong = 0;
            for (std::size_t k = 0; k < K; ++k) {
                const auto differences = static_cast<unsigned>(bits[k] ^ decided[k]);
                bitErrors += static_cast<std::uint64_t>(std::popcount(differences));
                wrong |= differences;
            }
            blocks += lanes;
            blockErrors += static_cast<std::uint64_t>(std::popcount(wrong));
        }
        std::cout << "quarzel_other_decoders," << K << ',' << 3 * K + 12 << ','
                  << (options.isRayleigh ? "rayleigh" : "awgn") << ",BPSK,\"" << options.label << "\","
                  << options.iterations << ',' << ebN0 << ',' << blocks << ',' << bitErrors << ','
                  << blockErrors << std::endl;
    }
}

int run(int count, char** arguments) {
    Options options;
    CLI::App app("Block error rates of other decoders on the link of a sweep");
    app.add_option("--decoder", options.decoder)
        ->check(CLI::IsMember({"float", "float-log-map", "core", "one-segment"}));
    app.add_option("--block-size", options.blockSize);
    app.add_option("--iterations", options.iterations);
    app.add_option("--ebn0", options.ebN0)->delimiter(',')->required();
    app.add_option("--scale", options.scales, "Float: factors of the extrinsics, one an iteration")
        ->delimiter(',');
    app.add_option("--segments", options.segments, "Float: thread segments");
    app.add_option("--units", options.units, "Core");
    app.add_option("--algorithm", options.algorithm, "Core, and one segment of it");
    app.add_option("--llr", options.factor, "Core, and one segment of it");
    app.add_flag("--rayleigh", options.isRayleigh, "A fading amplitude for every code bit");
    app.add_option("--max-blocks", options.maxBlocks);
    app.add_option("--max-block-errors", options.maxBlockErrors);
    app.add_option("--seed", options.seed);
    app.add_option("--label", options.label, "What the column decoder says")->required();
    CLI11_PARSE(app, count, arguments);
    simulate(options);
    return 0;
}

}  // namespace
}  // namespace quarzel::validation

int main(int count, char** arguments) {
    try {
        return quarzel::validation::run(count, arguments);
    } catch (const std::exception& error) {
        std::cerr << error.what() << '\n';
        return 1;
    }
}
