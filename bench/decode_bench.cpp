// SPDX-License-Identifier: MIT
// Whole decodes, conversion included: information bits a second, time per bit and half-iteration, heap
// allocations a call, and the bytes that the state has come to hold.
#include <benchmark/benchmark.h>

#include <cstdlib>

#include "bench/support.hpp"
#include "decoder/decoder_3gpu.hpp"
#include "interface/state.hpp"
#include "lanes/lane_decode.hpp"
#include "lanes/lanes.hpp"
#include "support/count_allocations.hpp"

namespace {

using namespace quarzel::bench;

void check(int status) {
    if (status != 0) {
        std::abort();
    }
}

/// Times `decode(state, blocks)`, which decodes all blocks once, with a state that `configure` has seen.
template <class Configure, class Decode>
void measure(benchmark::State& bench, std::size_t count, Configure configure, Decode decode) {
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), count);
    const std::size_t bytesBefore = heapBytes();
    const State state = makeState(bench.range(1), bench.range(2));
    configure(*state);
    check(decode(state.get(), blocks));
    bench.counters["state bytes"] = static_cast<double>(heapBytes() - bytesBefore);
    const std::size_t before = quarzel::test::allocationCount();
    for (auto _ : bench) {
        check(decode(state.get(), blocks));
        benchmark::DoNotOptimize(blocks.bits.data());
    }
    const auto calls = static_cast<double>(bench.iterations());
    const double bits = calls * blocks.informationBits();
    bench.counters["allocations"] = static_cast<double>(quarzel::test::allocationCount() - before) / calls;
    bench.counters["bit/s"] = benchmark::Counter(bits, benchmark::Counter::kIsRate);
    bench.counters["bit/half"] =
        benchmark::Counter(bits * 2 * iterations, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

int decodeOne(vardel_ip_quarzel_state* state, Blocks& blocks) {
    return vardel_ip_quarzel_bitacc_simulate(state, blocks.outputs.data(), blocks.inputs[0]);
}

int decodeBatch(vardel_ip_quarzel_state* state, Blocks& blocks) {
    return vardel_ip_quarzel_bitacc_simulate_batch(state, blocks.outputs.data(), blocks.inputs.data(),
                                                   static_cast<int>(blocks.inputs.size()), nullptr);
}

void asItIs(vardel_ip_quarzel_state&) {}

/// Blocks that fill a batch of about 100,000 bits.
std::size_t batchSize(const benchmark::State& bench) {
    return static_cast<std::size_t>(100000 / bench.range(0)) + 1;
}

/// One call of simulate a block.
void singleCall(benchmark::State& bench) {
    measure(bench, 1, asItIs, decodeOne);
}

void batchCall(benchmark::State& bench) {
    measure(bench, batchSize(bench), asItIs, decodeBatch);
}

/// Batches on several threads, a state each: the bits of all of them together in the time that passes.
void batchOnThreads(benchmark::State& bench) {
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), batchSize(bench));
    const State state = makeState(bench.range(1), bench.range(2));
    for (auto _ : bench) {
        check(decodeBatch(state.get(), blocks));
        benchmark::DoNotOptimize(blocks.bits.data());
    }
    bench.counters["bit/s"] = benchmark::Counter(
        static_cast<double>(bench.iterations()) * blocks.informationBits(), benchmark::Counter::kIsRate);
}

/// Batches of few blocks: how the speed grows with the group.
void groupOf(benchmark::State& bench) {
    measure(bench, static_cast<std::size_t>(bench.range(3)), asItIs, decodeBatch);
}

void literalRoad(benchmark::State& bench) {
    measure(
        bench, 1, [](vardel_ip_quarzel_state& state) { state.decoder->disableLanes(); }, decodeOne);
}

/// A batch by one instruction set.
void lanesOf(benchmark::State& bench, const quarzel::lanes::Candidate& candidate) {
    measure(
        bench, batchSize(bench),
        [&](vardel_ip_quarzel_state& state) {
            static_cast<TDecoder3GPU&>(*state.decoder).enableLanes(candidate);
        },
        decodeBatch);
}

void arguments(benchmark::internal::Benchmark* bench, const std::vector<std::vector<std::int64_t>>& product) {
    bench->ArgNames({"K", "units", "algorithm"})->ArgsProduct(product)->Unit(benchmark::kMicrosecond);
}

void everyShape(benchmark::internal::Benchmark* bench) {
    arguments(bench, {{40, 64, 512, 1024, 2048, 6144}, {2, 4, 8}, {0, 1, 2}});
}

void someShapes(benchmark::internal::Benchmark* bench) {
    arguments(bench, {{40, 1024, 6144}, {8}, {0, 1, 2}});
}

BENCHMARK(batchCall)->Apply(everyShape);
BENCHMARK(singleCall)->Apply(everyShape);
BENCHMARK(batchOnThreads)->Apply(someShapes)->ThreadRange(1, 2)->UseRealTime();
BENCHMARK(groupOf)
    ->ArgNames({"K", "units", "algorithm", "blocks"})
    ->ArgsProduct({{40, 1024, 6144}, {8}, {1}, {1, 2, 4, 8, 16, 32, 64}})
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(literalRoad)->Apply(someShapes);

const int registered = [] {
    for (const quarzel::lanes::Candidate& candidate : quarzel::lanes::candidates()) {
        if (candidate.supported()) {
            benchmark::RegisterBenchmark((std::string("lanes/") + candidate.name).c_str(), lanesOf, candidate)
                ->Apply(someShapes);
        }
    }
    return 0;
}();

}  // namespace
