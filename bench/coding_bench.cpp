// SPDX-License-Identifier: MIT
// The stages of the coding chain, one block at a time at rate 1/2, in nanoseconds for an information bit, and
// those of modulation, for a coded bit. A plain loop over bits stands beside the CRC.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <random>
#include <vector>

#include "link/coding/crc.hpp"
#include "link/coding/rate_matching.hpp"
#include "link/coding/rate_recovery.hpp"
#include "link/coding/segmentation.hpp"
#include "link/coding/transport_block.hpp"
#include "link/coding/turbo_encoding.hpp"
#include "link/modulation/demodulation.hpp"

namespace {

using namespace quarzel;
using namespace quarzel::link;

constexpr int iterations = 8;

void perBit(benchmark::State& bench, std::size_t bits) {
    const double count = static_cast<double>(bits) * static_cast<double>(bench.iterations());
    bench.counters["ns/bit"] =
        benchmark::Counter(count * 1e-9, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

std::vector<std::uint8_t> randomBits(std::size_t size) {
    std::mt19937 random(1);
    std::vector<std::uint8_t> bits(size);
    std::generate(bits.begin(), bits.end(), [&] { return static_cast<std::uint8_t>(random() & 1U); });
    return bits;
}

template <class Value>
std::vector<Value> randomSoft(std::size_t size) {
    std::mt19937 random(1);
    std::uniform_int_distribution<int> value(-60, 60);
    std::vector<Value> soft(size);
    std::generate(soft.begin(), soft.end(), [&] { return static_cast<Value>(value(random)); });
    return soft;
}

std::uint32_t sizeOf(const benchmark::State& bench) {
    return static_cast<std::uint32_t>(bench.range(0));
}

void crc24A(benchmark::State& bench) {
    const auto bits = randomBits(sizeOf(bench));
    for (auto _ : bench) {
        benchmark::DoNotOptimize(crcOf(Crc::crc24A, bits));
    }
    perBit(bench, bits.size());
}

void crc24ABitByBit(benchmark::State& bench) {
    const auto bits = randomBits(sizeOf(bench));
    for (auto _ : bench) {
        std::uint32_t remainder = 0;
        for (const std::uint8_t bit : bits) {
            remainder ^= std::uint32_t{bit} << 23;
            remainder = (remainder << 1 ^ ((remainder >> 23 & 1U) != 0 ? 0x864cfbU : 0U)) & 0xffffffU;
        }
        benchmark::DoNotOptimize(remainder);
    }
    perBit(bench, bits.size());
}

void segmentation(benchmark::State& bench) {
    const auto bits = randomBits(20000);
    const Segmentation sizes = segmentationOf(bits.size());
    std::vector<std::uint8_t> blocks(sizes.totalSize());
    for (auto _ : bench) {
        segment(sizes, bits, blocks);
        benchmark::DoNotOptimize(blocks.data());
    }
    perBit(bench, bits.size());
}

void reassembly(benchmark::State& bench) {
    auto bits = randomBits(20000);
    const Segmentation sizes = segmentationOf(bits.size());
    std::vector<std::uint8_t> blocks(sizes.totalSize());
    segment(sizes, bits, blocks);
    for (auto _ : bench) {
        benchmark::DoNotOptimize(desegment(sizes, blocks, bits));
    }
    perBit(bench, bits.size());
}

void turboEncoding(benchmark::State& bench) {
    const Encoder encoder(sizeOf(bench));
    const auto bits = randomBits(encoder.blockSize());
    std::vector<std::uint8_t> streams(3 * encoder.positions());
    for (auto _ : bench) {
        turboEncode(encoder, bits, 0, streams);
        benchmark::DoNotOptimize(streams.data());
    }
    perBit(bench, bits.size());
}

void rateMatchingTables(benchmark::State& bench) {
    for (auto _ : bench) {
        benchmark::DoNotOptimize(RateMatching(sizeOf(bench)));
    }
    perBit(bench, sizeOf(bench));
}

void matching(benchmark::State& bench) {
    const RateMatching tables(sizeOf(bench));
    const auto streams = randomBits(3 * tables.positions());
    std::vector<std::uint8_t> coded(2 * sizeOf(bench));
    for (auto _ : bench) {
        rateMatch(tables, 0, streams, coded);
        benchmark::DoNotOptimize(coded.data());
    }
    perBit(bench, sizeOf(bench));
}

template <class Soft>
void recovery(benchmark::State& bench) {
    const RateMatching tables(sizeOf(bench));
    const auto soft = randomSoft<Soft>(2 * sizeOf(bench));
    std::vector<std::int16_t> buffer(tables.codeBits());
    for (auto _ : bench) {
        rateRecover(tables, 0, soft, buffer);
        benchmark::DoNotOptimize(buffer.data());
    }
    perBit(bench, sizeOf(bench));
}

void streamsOfBuffer(benchmark::State& bench) {
    const RateMatching tables(sizeOf(bench));
    const auto buffer = randomSoft<std::int16_t>(tables.codeBits());
    std::vector<std::int8_t> streams(3 * tables.positions());
    for (auto _ : bench) {
        readStreams(tables, buffer, streams);
        benchmark::DoNotOptimize(streams.data());
    }
    perBit(bench, sizeOf(bench));
}

void modulation(benchmark::State& bench) {
    const auto scheme = static_cast<Modulation>(bench.range(0));
    const auto bits = randomBits(2400 * bitsOfSymbol(scheme));
    std::vector<std::complex<double>> symbols(2400);
    for (auto _ : bench) {
        modulate(bits, scheme, symbols);
        benchmark::DoNotOptimize(symbols.data());
    }
    perBit(bench, bits.size());
}

template <Demapping demapping>
void demodulation(benchmark::State& bench) {
    const auto scheme = static_cast<Modulation>(bench.range(0));
    const auto bits = randomBits(2400 * bitsOfSymbol(scheme));
    std::vector<std::complex<double>> symbols(2400);
    modulate(bits, scheme, symbols);
    const std::vector<double> variance = {0.1};
    std::vector<double> ratios(bits.size());
    for (auto _ : bench) {
        demodulate(symbols, scheme, variance, ratios, demapping);
        benchmark::DoNotOptimize(ratios.data());
    }
    perBit(bench, bits.size());
}

void transportBlockEncoder(benchmark::State& bench) {
    const auto bits = randomBits(static_cast<std::size_t>(bench.range(0)));
    const TransportBlockCode code(bits.size());
    const Transmission transmission{2 * bits.size()};
    std::vector<std::uint8_t> coded(transmission.G);
    for (auto _ : bench) {
        code.encode(bits, transmission, coded);
        benchmark::DoNotOptimize(coded.data());
    }
    perBit(bench, bits.size());
}

void transportBlockDecoder(benchmark::State& bench) {
    const auto A = static_cast<std::size_t>(bench.range(0));
    const TransportBlockCode code(A);
    const auto soft = randomSoft<std::int16_t>(2 * A);
    Core core;
    for (auto _ : bench) {
        SoftBuffers buffers;
        benchmark::DoNotOptimize(code.decode(soft, {2 * A}, core, iterations, buffers));
    }
    perBit(bench, A);
}

/// The part of it that is the core's, on blocks of the largest size.
void coreAlone(benchmark::State& bench) {
    const std::size_t positions = maxBlockSize + quarzel::tailPositions;
    const std::size_t count = static_cast<std::size_t>(bench.range(0)) / maxBlockSize + 1;
    const auto soft = randomSoft<std::int8_t>(3 * positions * count);
    std::vector<std::uint8_t> bits(maxBlockSize * count);
    Core core;
    for (auto _ : bench) {
        core.decode(softBlocks<std::int8_t>(soft, positions), iterations, bits);
        benchmark::DoNotOptimize(bits.data());
    }
    perBit(bench, bits.size());
}

BENCHMARK(crc24A)->Arg(6144);
BENCHMARK(crc24ABitByBit)->Arg(6144);
BENCHMARK(segmentation);
BENCHMARK(reassembly);
BENCHMARK(turboEncoding)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(rateMatchingTables)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(matching)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(recovery<std::int8_t>)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(recovery<std::int16_t>)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(streamsOfBuffer)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(modulation)->ArgName("Qm")->Arg(1)->Arg(2)->Arg(4)->Arg(6)->Arg(8);
BENCHMARK(demodulation<Demapping::maxLog>)->ArgName("Qm")->Arg(1)->Arg(2)->Arg(4)->Arg(6)->Arg(8);
BENCHMARK(demodulation<Demapping::exact>)->ArgName("Qm")->Arg(1)->Arg(2)->Arg(4)->Arg(6)->Arg(8);
BENCHMARK(transportBlockEncoder)->ArgName("A")->Arg(4264)->Arg(75376);
BENCHMARK(transportBlockDecoder)->ArgName("A")->Arg(4264)->Arg(75376);
BENCHMARK(coreAlone)->ArgName("A")->Arg(4264)->Arg(75376);

}  // namespace
