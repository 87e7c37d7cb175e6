// SPDX-License-Identifier: MIT
// Whole decodes, conversion included: information Mbit/s, nanoseconds per bit and half-iteration, and heap
// allocations a call.
#include <benchmark/benchmark.h>

#include <cstdlib>

#include "bench/support.hpp"
#include "decoder/decoder_3gpu.hpp"
#include "decoder/lane_decode.hpp"
#include "engine/lanes/lanes.hpp"
#include "interface/state.hpp"
#include "support/count_allocations.hpp"

namespace {

using namespace quarzel::bench;

/// Times `decode`, a call that decodes all blocks once.
template <class Decode>
void measure(benchmark::State& bench, const Blocks& blocks, Decode decode) {
    decode();
    const std::size_t before = quarzel::test::allocationCount();
    for (auto _ : bench) {
        decode();
        benchmark::DoNotOptimize(blocks.bits.data());
    }
    const auto calls = static_cast<double>(bench.iterations());
    const double bits = calls * blocks.informationBits();
    bench.counters["allocations"] = static_cast<double>(quarzel::test::allocationCount() - before) / calls;
    bench.counters["Mbit/s"] = benchmark::Counter(bits * 1e-6, benchmark::Counter::kIsRate);
    bench.counters["ns/bit/half"] = benchmark::Counter(
        bits * 2 * iterations * 1e-9, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

void check(int status) {
    if (status != 0) {
        std::abort();
    }
}

/// One call of simulate a block.
void singleCall(benchmark::State& bench) {
    const State state = makeState(bench.range(1), bench.range(2));
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), 1);
    measure(bench, blocks, [&] {
        check(vardel_ip_quarzel_bitacc_simulate(state.get(), blocks.outputs.data(), blocks.inputs[0]));
    });
}

/// Blocks that fill a batch of about 100,000 bits.
std::size_t batchSize(std::int64_t K) {
    return static_cast<std::size_t>(100000 / K) + 1;
}

void batchCall(benchmark::State& bench) {
    const State state = makeState(bench.range(1), bench.range(2));
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), batchSize(bench.range(0)));
    measure(bench, blocks, [&] {
        check(vardel_ip_quarzel_bitacc_simulate_batch(state.get(), blocks.outputs.data(),
                                                      blocks.inputs.data(),
                                                      static_cast<int>(blocks.inputs.size()), nullptr));
    });
}

void literalRoad(benchmark::State& bench) {
    const State state = makeState(bench.range(1), bench.range(2));
    state->decoder->disableLanes();
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), 1);
    measure(bench, blocks, [&] {
        check(vardel_ip_quarzel_bitacc_simulate(state.get(), blocks.outputs.data(), blocks.inputs[0]));
    });
}

/// A batch by one instruction set.
void lanesOf(benchmark::State& bench, const quarzel::lanes::Candidate& candidate) {
    const State state = makeState(bench.range(1), bench.range(2));
    static_cast<TDecoder3GPU&>(*state->decoder).enableLanes(candidate);
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), batchSize(bench.range(0)));
    measure(bench, blocks, [&] {
        check(vardel_ip_quarzel_bitacc_simulate_batch(state.get(), blocks.outputs.data(),
                                                      blocks.inputs.data(),
                                                      static_cast<int>(blocks.inputs.size()), nullptr));
    });
}

void arguments(benchmark::internal::Benchmark* bench, const std::vector<std::vector<std::int64_t>>& product) {
    bench->ArgNames({"K", "units", "algorithm"})->ArgsProduct(product)->Unit(benchmark::kMicrosecond);
}

void everyShape(benchmark::internal::Benchmark* bench) {
    arguments(bench, {{40, 512, 1024, 2048, 6144}, {2, 4, 8}, {0, 1, 2}});
}

void someShapes(benchmark::internal::Benchmark* bench) {
    arguments(bench, {{40, 1024, 6144}, {8}, {0, 1, 2}});
}

BENCHMARK(batchCall)->Apply(everyShape);
BENCHMARK(singleCall)->Apply(everyShape);
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
