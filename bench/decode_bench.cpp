// SPDX-License-Identifier: MIT
// Whole decodes, conversion included: information bits a second, time per bit and half-iteration, heap
// allocations a call, and the bytes that the core has come to hold.
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <span>
#include <string>

#include "bench/support.hpp"
#include "support/count_allocations.hpp"

namespace {

using namespace quarzel;
using namespace quarzel::bench;

void check(int status) {
    if (status != 0) {
        std::abort();
    }
}

void countBits(benchmark::State& bench, double bitsOfCall) {
    const double bits = static_cast<double>(bench.iterations()) * bitsOfCall;
    bench.counters["bit/s"] = benchmark::Counter(bits, benchmark::Counter::kIsRate);
    bench.counters["bit/half"] =
        benchmark::Counter(bits * 2 * iterations, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

/// Times `decode(core, blocks)`, which decodes all blocks once, with a core that `configure` has seen.
template <class Configure, class Decode>
void measure(benchmark::State& bench, std::size_t count, Configure configure, Decode decode) {
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), count);
    const std::size_t bytesBefore = heapBytes();
    Core core = makeCore(bench.range(1), bench.range(2));
    configure(core);
    decode(core, blocks);
    bench.counters["core bytes"] = static_cast<double>(heapBytes() - bytesBefore);
    const std::size_t before = test::allocationCount();
    for (auto _ : bench) {
        decode(core, blocks);
        benchmark::DoNotOptimize(blocks.bits.data());
    }
    bench.counters["allocations"] =
        static_cast<double>(test::allocationCount() - before) / static_cast<double>(bench.iterations());
    countBits(bench, blocks.informationBits());
}

void decodeOne(const Core& core, Blocks& blocks) {
    check(vardel_ip_quarzel_bitacc_simulate(core.state(), blocks.outputs.data(), blocks.inputs[0]));
}

void decodeBatch(const Core& core, Blocks& blocks) {
    check(vardel_ip_quarzel_bitacc_simulate_batch(core.state(), blocks.outputs.data(), blocks.inputs.data(),
                                                  static_cast<int>(blocks.inputs.size()), nullptr));
}

void asItIs(Core&) {}

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

/// Blocks of an array of a type of soft values.
template <class Value>
void arrayCall(benchmark::State& bench) {
    std::vector<Value> soft;
    measure(bench, batchSize(bench), asItIs, [&soft](Core& core, Blocks& blocks) {
        if (soft.empty()) {
            soft.assign(blocks.soft.begin(), blocks.soft.end());
        }
        core.decode(softBlocks(std::span<const Value>(soft), blocks.K + tailPositions), iterations,
                    blocks.bits);
    });
}

/// Single calls of K = 6144 and K = 40 in turns, on as many cores as the argument says: what a change of the
/// size costs one core.
void alternatingSizes(benchmark::State& bench) {
    Blocks large(6144, 1);
    Blocks small(40, 1);
    const Core first = makeCore(8, 1);
    const Core second = makeCore(8, 1);
    const Core& ofSmall = bench.range(0) == 1 ? first : second;
    for (auto _ : bench) {
        decodeOne(first, large);
        decodeOne(ofSmall, small);
    }
    countBits(bench, large.informationBits() + small.informationBits());
}

/// Batches on several threads, a core each: the bits of all of them together in the time that passes.
void batchOnThreads(benchmark::State& bench) {
    Blocks blocks(static_cast<std::size_t>(bench.range(0)), batchSize(bench));
    const Core core = makeCore(bench.range(1), bench.range(2));
    for (auto _ : bench) {
        decodeBatch(core, blocks);
        benchmark::DoNotOptimize(blocks.bits.data());
    }
    countBits(bench, blocks.informationBits());
}

/// Batches of few blocks: how the speed grows with the group.
void groupOf(benchmark::State& bench) {
    measure(bench, static_cast<std::size_t>(bench.range(3)), asItIs, decodeBatch);
}

/// A batch by one implementation.
void implementation(benchmark::State& bench, const std::string& name) {
    measure(
        bench, batchSize(bench), [&](Core& core) { core.choose(name); }, decodeBatch);
}

void arguments(benchmark::internal::Benchmark* bench, const std::vector<std::vector<std::int64_t>>& product) {
    bench->ArgNames({"K", "units", "algorithm"})->ArgsProduct(product)->Unit(benchmark::kMicrosecond);
}

void everyShape(benchmark::internal::Benchmark* bench) {
    arguments(bench, {{40, 64, 512, 1024, 2048, 6144}, {2, 4, 8}, {0, 1, 2}});
}

void someShapes(benchmark::internal::Benchmark* bench) {
    arguments(bench, {{40, 512, 1024, 6144}, {8}, {0, 1, 2}});
}

void someSizes(benchmark::internal::Benchmark* bench) {
    arguments(bench, {{40, 64, 512, 1024, 6144}, {8}, {1}});
}

BENCHMARK(batchCall)->Apply(everyShape);
BENCHMARK(singleCall)->Apply(everyShape);
BENCHMARK_TEMPLATE(arrayCall, std::int8_t)->Apply(someSizes);
BENCHMARK_TEMPLATE(arrayCall, std::int16_t)->Apply(someSizes);
BENCHMARK_TEMPLATE(arrayCall, std::int32_t)->Apply(someSizes);
BENCHMARK(alternatingSizes)->ArgName("cores")->Arg(1)->Arg(2)->Unit(benchmark::kMicrosecond);
BENCHMARK(batchOnThreads)->Apply(someShapes)->ThreadRange(1, 2)->UseRealTime();
BENCHMARK(groupOf)
    ->ArgNames({"K", "units", "algorithm", "blocks"})
    ->ArgsProduct({{40, 1024, 6144}, {8}, {1}, {1, 2, 4, 8, 16, 32, 64}})
    ->Unit(benchmark::kMicrosecond);

const int registered = [] {
    for (const std::string& name : implementations()) {
        benchmark::RegisterBenchmark(("implementation/" + name).c_str(), implementation, name)
            ->Apply(someShapes);
    }
    return 0;
}();

}  // namespace
