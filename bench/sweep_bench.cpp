// SPDX-License-Identifier: MIT
// A sweep next to the decoder alone, in turns, so that what else the machine does strikes both: "share" is
// the decoder's time over the sweep's, 1 when bits, encoder, noise and counting cost nothing. A sweep that
// counts errors after every iteration next to one that does not: "cost" is the ratio of their times. And the
// parts of a sweep by themselves, in nanoseconds for an information bit.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <ctime>
#include <numeric>
#include <span>
#include <vector>

#include "bench/support.hpp"
#include "link/encoder.hpp"
#include "link/quantised_channel.hpp"
#include "quarzel/core.hpp"
#include "sweep/block_simulator.hpp"

namespace {

using namespace quarzel;

constexpr int sweepIterations = 8;
constexpr link::Decibels ebN0 = {1'500'000};

double threadSeconds() {
    timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

/// Octets of blocks as a sweep hands them out.
std::vector<std::uint64_t> octetsOf(std::uint64_t K) {
    std::vector<std::uint64_t> octets(std::max<std::uint64_t>(32768 / (8 * K), 1));
    std::iota(octets.begin(), octets.end(), 0);
    return octets;
}

void sweepAndDecoder(benchmark::State& bench) {
    sweep::Configuration configuration;
    sweep::Channels channels(configuration.quantiser);
    sweep::BlockSimulator simulator(configuration, channels);
    const sweep::Curve curve{static_cast<std::uint32_t>(bench.range(0)), static_cast<int>(bench.range(1)),
                             static_cast<int>(bench.range(2)), sweepIterations};
    const std::vector<std::uint64_t> octets = octetsOf(curve.blockSize);

    Core core(CoreSettings{curve.units, curve.algorithm});
    bench::Blocks blocks(curve.blockSize, octets.size() * 8);
    const std::vector<std::int8_t> soft(blocks.soft.begin(), blocks.soft.end());
    double sweepSeconds = 0;
    double decoderSeconds = 0;
    simulator.simulate(curve, ebN0, octets);
    for (auto _ : bench) {
        const double start = threadSeconds();
        benchmark::DoNotOptimize(simulator.simulate(curve, ebN0, octets));
        const double middle = threadSeconds();
        core.decode(softBlocks(std::span(soft), curve.blockSize + tailPositions), sweepIterations,
                    blocks.bits);
        sweepSeconds += middle - start;
        decoderSeconds += threadSeconds() - middle;
    }
    const double bits = blocks.informationBits() * static_cast<double>(bench.iterations());
    bench.counters["share"] = decoderSeconds / sweepSeconds;
    bench.counters["sweep ns/bit"] = sweepSeconds / bits * 1e9;
    bench.counters["decoder ns/bit"] = decoderSeconds / bits * 1e9;
}

void everyIteration(benchmark::State& bench) {
    const sweep::Configuration onlyLast;
    sweep::Configuration every;
    every.perIteration = true;
    sweep::Channels channels(onlyLast.quantiser);
    sweep::BlockSimulator simulatorOfLast(onlyLast, channels);
    sweep::BlockSimulator simulatorOfEvery(every, channels);
    const sweep::Curve curve{static_cast<std::uint32_t>(bench.range(0)), 8, 1,
                             static_cast<int>(bench.range(1))};
    const std::vector<std::uint64_t> octets = octetsOf(curve.blockSize);
    const auto secondsOf = [&](sweep::BlockSimulator& simulator) {
        const double start = threadSeconds();
        benchmark::DoNotOptimize(simulator.simulate(curve, ebN0, octets));
        return threadSeconds() - start;
    };
    double secondsOfLast = 0;
    double secondsOfEvery = 0;
    for (auto _ : bench) {
        secondsOfLast += secondsOf(simulatorOfLast);
        secondsOfEvery += secondsOf(simulatorOfEvery);
        secondsOfEvery += secondsOf(simulatorOfEvery);  // the second finds the caches warm
        secondsOfLast += secondsOf(simulatorOfLast);
    }
    bench.counters["cost"] = secondsOfEvery / secondsOfLast;
}

/// Report the time for an information bit.
void perBit(benchmark::State& bench, double bits) {
    bench.counters["ns/bit"] = benchmark::Counter(bits * static_cast<double>(bench.iterations()) * 1e-9,
                                                  benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

void informationBits(benchmark::State& bench) {
    const auto K = static_cast<std::uint32_t>(bench.range(0));
    std::vector<std::uint8_t> bits(K);
    for (auto _ : bench) {
        link::RandomSource({1, K, ebN0, 1}).informationBits(3, bits.data());
        benchmark::DoNotOptimize(bits.data());
    }
    perBit(bench, K);
}

void encoder(benchmark::State& bench) {
    const link::Encoder encoder(static_cast<std::uint32_t>(bench.range(0)));
    std::vector<std::uint8_t> bits(encoder.blockSize(), 0x5a);
    std::vector<std::uint8_t> streams(3 * encoder.positions());
    for (auto _ : bench) {
        encoder.encode(bits.data(), streams.data());
        benchmark::DoNotOptimize(streams.data());
    }
    perBit(bench, 8 * static_cast<double>(encoder.blockSize()));
}

void channel(benchmark::State& bench) {
    const auto K = static_cast<std::uint32_t>(bench.range(0));
    const link::QuantisedChannel channel({link::Quantiser::Kind::llr, 8}, ebN0);
    std::vector<std::uint8_t> streams(3 * (K + 4), 0x5a);
    std::vector<std::int8_t> soft(streams.size());
    for (auto _ : bench) {
        channel.transmit(link::RandomSource({1, K, ebN0, 1}), streams.data(), 3, streams.size(), soft.data());
        benchmark::DoNotOptimize(soft.data());
    }
    perBit(bench, K);
}

BENCHMARK(sweepAndDecoder)
    ->ArgNames({"K", "units", "algorithm"})
    ->ArgsProduct({{40, 1024, 6144}, {2, 8}, {0, 1, 2}})
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(everyIteration)
    ->ArgNames({"K", "iterations"})
    ->ArgsProduct({{40, 1024, 6144}, {1, 6, 15}})
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(informationBits)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(encoder)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(channel)->Arg(40)->Arg(1024)->Arg(6144);

}  // namespace
