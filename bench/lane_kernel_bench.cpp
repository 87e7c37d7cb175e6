// SPDX-License-Identifier: MIT
// The lanes kernel by kernel, for each instruction set: the time of a row of one vector (the trellis steps of
// all its lanes). Beside them the limits, loops of what no decoder of this arithmetic can do without.
#include <benchmark/benchmark.h>

#include <span>
#include <string>
#include <vector>

#include "bench/lane_kernels.hpp"
#include "bench/support.hpp"
#include "decoder/segments.hpp"
#include "lanes/lane_decode.hpp"

namespace quarzel::bench {

extern const LaneKernels baselineKernels;
#if defined(__x86_64__)
extern const LaneKernels sse41Kernels;
extern const LaneKernels avx2Kernels;
extern const LaneKernels avx512bwKernels;
#endif

namespace {

using lanes::LaneGroup;

/// A group that fills vectors, as the decoder lays it out. A kernel that only keeps the group stands in for
/// the decoding one.
class LaidOut {
  public:
    LaidOut(std::size_t width, std::uint32_t K, std::uint32_t units)
        : itsKernels{{lanes::sliceLanes, {keep, keep, keep}, {}, {}},
                     {width, {keep, keep, keep}, {keep, keep, keep}, {}}},
          itsCandidate{"layout", [] { return true; }, itsKernels, width > lanes::sliceLanes ? 2U : 1U},
          itsDecoder(1, itsCandidate),
          itsBlocks(K, width) {
        const Layout cut = layout(K, units);
        itsDecoder.add({permutation(K), cut.segments, windowLengths(cut.segment_steps)});
        std::vector<LaneBlock> blocks;
        for (std::size_t i = 0; i < width; ++i) {
            const auto& in = itsBlocks.inputs[i];
            blocks.push_back({{in.rsc1_sys, in.rsc1_par, in.rsc2_par}, itsBlocks.outputs[i].dout});
        }
        itsDecoder.decode(
            K, {std::span(blocks).first(width / lanes::sliceLanes), sizeof(std::int32_t), iterations, 0});
        itsGroup = kept;
    }

    const LaneGroup& group() const { return itsGroup; }

  private:
    inline static LaneGroup kept;
    static bool keep(const LaneGroup& group) {
        kept = group;
        return false;
    }

    lanes::LaneKernel itsKernels[2];  ///< the narrowest, and the one of that width
    lanes::Candidate itsCandidate;
    LaneDecoder itsDecoder;
    Blocks itsBlocks;
    LaneGroup itsGroup;
};

using Kernel = void (*)(const LaneGroup&);

void countRows(benchmark::State& bench, std::size_t rowsOfCall, std::size_t width) {
    const auto rows = static_cast<double>(rowsOfCall) * static_cast<double>(bench.iterations());
    bench.counters["row"] =
        benchmark::Counter(rows, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
    bench.counters["bit"] = benchmark::Counter(rows * static_cast<double>(width),
                                               benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

/// Forward and backward together.
void measureLimit(benchmark::State& bench, const LaneKernels& kernels, const Limit& limit) {
    constexpr std::size_t rows = 32 * limitRows;
    constexpr std::size_t line = 32;
    std::vector<std::int16_t> memory(limitRows * limitVectors * kernels.width + line, 64);
    void* first = memory.data();
    std::size_t space = memory.size() * sizeof memory[0];
    auto* const aligned = static_cast<std::int16_t*>(std::align(2 * line, space - 2 * line, first, space));
    for (auto _ : bench) {
        limit.run(rows, aligned);
        benchmark::ClobberMemory();
    }
    countRows(bench, rows, kernels.width);
}

void measure(benchmark::State& bench, const LaneKernels& kernels, Kernel kernel) {
    const LaidOut laidOut(kernels.width, static_cast<std::uint32_t>(bench.range(0)),
                          static_cast<std::uint32_t>(bench.range(1)));
    const LaneGroup& group = laidOut.group();
    // In the order of a decode, so that each works on values that the one before has made.
    kernels.readInputs(group);
    kernels.forward[1](group);
    kernels.backward[1](group);
    for (auto _ : bench) {
        kernel(group);
        benchmark::ClobberMemory();
    }
    countRows(bench, group.steps * group.slices, kernels.width);
}

void add(const char* candidate, const LaneKernels& kernels) {
    for (const lanes::Candidate& known : lanes::candidates()) {
        if (known.name != std::string_view(candidate) || !known.supported()) {
            continue;
        }
        const auto one = [&](const std::string& name, Kernel kernel) {
            benchmark::RegisterBenchmark(
                (std::string("kernel/") + candidate + '/' + name).c_str(),
                [&kernels, kernel](benchmark::State& bench) { measure(bench, kernels, kernel); })
                ->ArgNames({"K", "units"})
                ->Args({6144, 8})
                ->Args({1024, 8})
                ->Args({512, 8});
        };
        one("readInputs", kernels.readInputs);
        for (std::size_t algorithm = 0; algorithm < 3; ++algorithm) {
            one("forward/type" + std::to_string(algorithm), kernels.forward[algorithm]);
            one("backward/type" + std::to_string(algorithm), kernels.backward[algorithm]);
        }
        one("writeDecisions", kernels.writeDecisions);
        for (const Limit& limit : kernels.limits) {
            benchmark::RegisterBenchmark(
                (std::string("limit/") + candidate + '/' + limit.name).c_str(),
                [&](benchmark::State& bench) { measureLimit(bench, kernels, limit); });
        }
    }
}

const int registered = [] {
    add("baseline", baselineKernels);
#if defined(__x86_64__)
    add("sse4.1", sse41Kernels);
    add("avx2", avx2Kernels);
    add("avx512bw", avx512bwKernels);
#endif
    return 0;
}();

}  // namespace

}  // namespace quarzel::bench
