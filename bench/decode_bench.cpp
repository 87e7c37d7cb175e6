// SPDX-License-Identifier: MIT
// Whole decodes through the C interface, conversion included: information Mbit/s and heap allocations a call.
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <memory>
#include <random>
#include <vector>

#include "support/count_allocations.hpp"
#include "vardel_ip_quarzel.h"

namespace {

constexpr int iterations = 6;

void decodeBlock(benchmark::State& bench) {
    const auto K = static_cast<std::size_t>(bench.range(0));
    vardel_ip_quarzel_generics generics;
    vardel_ip_quarzel_get_default_generics(&generics);
    generics.C_NUM_PU = static_cast<int>(bench.range(1));
    generics.C_ALGORITHM_TYPE = static_cast<int>(bench.range(2));
    const std::unique_ptr<vardel_ip_quarzel_state, void (*)(vardel_ip_quarzel_state*)> state(
        vardel_ip_quarzel_create_state(generics), vardel_ip_quarzel_destroy_state);

    std::mt19937 random(1);
    std::normal_distribution<float> noise(-8.0F, 8.0F);
    std::vector<int> streams[3];
    for (std::vector<int>& stream : streams) {
        for (std::size_t i = 0; i < K + 4; ++i) {
            stream.push_back(static_cast<int>(noise(random)));
        }
    }
    std::vector<unsigned char> bits(K);
    vardel_ip_quarzel_outputs outputs{bits.data(), static_cast<int>(K), 0, 0};
    const vardel_ip_quarzel_inputs inputs{streams[0].data(),       streams[1].data(), streams[2].data(),
                                          static_cast<int>(K + 4), iterations,        0};
    const auto decode = [&] {
        if (vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, inputs) != 0) {
            std::abort();
        }
    };
    decode();
    const std::size_t before = quarzel::test::allocationCount();
    for (auto _ : bench) {
        decode();
        benchmark::DoNotOptimize(bits.data());
    }
    const auto decodes = static_cast<double>(bench.iterations());
    bench.counters["allocations"] = static_cast<double>(quarzel::test::allocationCount() - before) / decodes;
    bench.counters["Mbit/s"] =
        benchmark::Counter(decodes * static_cast<double>(K) * 1e-6, benchmark::Counter::kIsRate);
}

BENCHMARK(decodeBlock)
    ->ArgNames({"K", "units", "algorithm"})
    ->ArgsProduct({{40, 512, 1024, 2048, 6144}, {2, 4, 8}, {0, 1, 2}})
    ->Unit(benchmark::kMicrosecond);

}  // namespace
