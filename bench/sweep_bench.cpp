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
#include "link/chain/link_run.hpp"
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
    sweep::Channels channels;
    sweep::BlockSimulator simulator(1, channels);
    const sweep::Setup setup{static_cast<std::uint32_t>(bench.range(0)),
                             static_cast<int>(bench.range(1)),
                             static_cast<int>(bench.range(2)),
                             sweepIterations,
                             {},
                             {},
                             ebN0};
    const std::vector<std::uint64_t> octets = octetsOf(setup.blockSize);

    Core core(CoreSettings{setup.units, setup.algorithm});
    bench::Blocks blocks(setup.blockSize, octets.size() * 8);
    const std::vector<std::int8_t> soft(blocks.soft.begin(), blocks.soft.end());
    double sweepSeconds = 0;
    double decoderSeconds = 0;
    simulator.simulate(setup, 1, octets);
    for (auto _ : bench) {
        const double start = threadSeconds();
        benchmark::DoNotOptimize(simulator.simulate(setup, 1, octets));
        const double middle = threadSeconds();
        core.decode(softBlocks(std::span(soft), setup.blockSize + tailPositions), sweepIterations,
                    blocks.bits);
        sweepSeconds += middle - start;
        decoderSeconds += threadSeconds() - middle;
    }
    const double bits = blocks.informationBits() * static_cast<double>(bench.iterations());
    bench.counters["share"] = decoderSeconds / sweepSeconds;
    bench.counters["sweep ns/bit"] = sweepSeconds / bits * 1e9;
    bench.counters["decoder ns/bit"] = decoderSeconds / bits * 1e9;
}

link::CodedLink codedLink(std::uint32_t K, link::ChannelSetup channel = {}) {
    return link::CodedLink({K, 0, 2 * std::size_t{K}, 1, {0, 2}, channel});
}

/// The whole chain at rate 1/2 next to the decoder alone, in turns.
void chainAndDecoder(benchmark::State& bench) {
    const auto K = static_cast<std::uint32_t>(bench.range(0));
    const CoreSettings settings{static_cast<int>(bench.range(1)), 1};
    const std::vector<std::uint64_t> octets = octetsOf(K);
    const link::CodedLink link = codedLink(K);
    const auto channel = link::makeChannel(link.setup().channel, ebN0, link.rate());
    link::LinkRun run(link, 1);
    Core core(settings);
    Core alone(settings);
    bench::Blocks blocks(K, octets.size() * 8);
    const std::vector<std::int8_t> soft(blocks.soft.begin(), blocks.soft.end());
    double chainSeconds = 0;
    double decoderSeconds = 0;
    const auto simulate = [&] {
        run.begin(ebN0, octets, octets.size() * 8);
        run.transmit(*channel, 0);
        run.decode(core, sweepIterations, false);
        for (std::size_t i = 0; i < run.size(); ++i) {
            benchmark::DoNotOptimize(run.verdict(i, 0));
        }
    };
    simulate();
    for (auto _ : bench) {
        const double start = threadSeconds();
        simulate();
        const double middle = threadSeconds();
        alone.decode(softBlocks(std::span(soft), K + tailPositions), sweepIterations, blocks.bits);
        chainSeconds += middle - start;
        decoderSeconds += threadSeconds() - middle;
    }
    const double bits = blocks.informationBits() * static_cast<double>(bench.iterations());
    bench.counters["share"] = decoderSeconds / chainSeconds;
    bench.counters["chain ns/bit"] = chainSeconds / bits * 1e9;
    bench.counters["decoder ns/bit"] = decoderSeconds / bits * 1e9;
}

void everyIteration(benchmark::State& bench) {
    sweep::Channels channels;
    sweep::BlockSimulator simulator(1, channels);
    const sweep::Setup setup{
        static_cast<std::uint32_t>(bench.range(0)), 8, 1, static_cast<int>(bench.range(1)), {}, {}, ebN0};
    const std::vector<std::uint64_t> octets = octetsOf(setup.blockSize);
    const auto secondsOf = [&](std::size_t counts) {
        const double start = threadSeconds();
        benchmark::DoNotOptimize(simulator.simulate(setup, counts, octets));
        return threadSeconds() - start;
    };
    const auto every = static_cast<std::size_t>(setup.iterations);
    double secondsOfLast = 0;
    double secondsOfEvery = 0;
    for (auto _ : bench) {
        secondsOfLast += secondsOf(1);
        secondsOfEvery += secondsOf(every);
        secondsOfEvery += secondsOf(every);  // the second finds the caches warm
        secondsOfLast += secondsOf(1);
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
        link::RandomSource({1, K, ebN0, 1}).octetBits(bits.data());
        benchmark::DoNotOptimize(bits.data());
    }
    perBit(bench, 8.0 * K);
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
    std::vector<std::int8_t> soft(8 * streams.size());
    for (auto _ : bench) {
        channel.transmitOctet(link::RandomSource({1, K, ebN0, 1}), streams.data(), streams.size(),
                              soft.data());
        benchmark::DoNotOptimize(soft.data());
    }
    perBit(bench, 8.0 * K);
}

void drawAndEncode(benchmark::State& bench) {
    const link::CodedLink link = codedLink(static_cast<std::uint32_t>(bench.range(0)));
    link::LinkRun run(link, 1);
    for (auto _ : bench) {
        run.begin(ebN0, std::vector<std::uint64_t>{0}, 8);
    }
    perBit(bench, 8 * static_cast<double>(link.informationBits()));
}

/// A transmission at rate 1/2, the first one or a second one that is combined with it.
void transmission(benchmark::State& bench) {
    const auto modulation = static_cast<link::Modulation>(bench.range(1));
    const auto fading = static_cast<link::Fading>(bench.range(2));
    const link::CodedLink link = codedLink(6144, {modulation, fading, link::Demapping::maxLog, {}});
    const auto channel = link::makeChannel(link.setup().channel, ebN0, link.rate());
    link::LinkRun run(link, 1);
    run.begin(ebN0, std::vector<std::uint64_t>{0}, 8);
    for (auto _ : bench) {
        run.transmit(*channel, static_cast<std::uint32_t>(bench.range(0)));
    }
    perBit(bench, 8 * static_cast<double>(link.informationBits()));
}

void transportBlocks(benchmark::State& bench) {
    const link::CodedLink link({0,
                                static_cast<std::uint32_t>(bench.range(0)),
                                2 * static_cast<std::size_t>(bench.range(0)),
                                1,
                                {0},
                                {}});
    const auto channel = link::makeChannel(link.setup().channel, ebN0, link.rate());
    link::LinkRun run(link, 1);
    for (auto _ : bench) {
        run.begin(ebN0, std::vector<std::uint64_t>{0}, 8);
        run.transmit(*channel, 0);
    }
    perBit(bench, 8 * static_cast<double>(link.informationBits()));
}

void channelTables(benchmark::State& bench) {
    const auto modulation = static_cast<link::Modulation>(bench.range(0));
    const auto demapping = static_cast<link::Demapping>(bench.range(1));
    for (auto _ : bench) {
        benchmark::DoNotOptimize(
            link::makeChannel({modulation, link::Fading::none, demapping, {}}, {5000000}, {}));
    }
}

BENCHMARK(sweepAndDecoder)
    ->ArgNames({"K", "units", "algorithm"})
    ->ArgsProduct({{40, 512, 1024, 6144}, {2, 8}, {0, 1, 2}})
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(chainAndDecoder)
    ->ArgNames({"K", "units"})
    ->ArgsProduct({{40, 1024, 6144}, {2, 8}})
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(everyIteration)
    ->ArgNames({"K", "iterations"})
    ->ArgsProduct({{40, 1024, 6144}, {1, 6, 15}})
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(informationBits)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(encoder)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(channel)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(drawAndEncode)->Arg(40)->Arg(1024)->Arg(6144);
BENCHMARK(transmission)
    ->ArgNames({"number", "Qm", "fading"})
    ->ArgsProduct({{0, 1}, {2, 4, 6, 8}, {0, 1}})
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(transportBlocks)->ArgName("A")->Arg(4264)->Arg(75376)->Unit(benchmark::kMicrosecond);
BENCHMARK(channelTables)
    ->ArgNames({"Qm", "exact"})
    ->ArgsProduct({{2, 4, 6, 8}, {0, 1}})
    ->Unit(benchmark::kMillisecond);

}  // namespace
