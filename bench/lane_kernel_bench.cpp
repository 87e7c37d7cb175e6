// SPDX-License-Identifier: MIT
// The lane road kernel by kernel, for each instruction set: the time of a row of one vector (the trellis
// steps of all its lanes), which is what the operation counts of docs/performance.md are held against.
#include <benchmark/benchmark.h>

#include <span>
#include <string>
#include <vector>

#include "bench/lane_kernels.hpp"
#include "bench/support.hpp"
#include "interleaver/interleaver.hpp"
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

/// A group that fills vectors, as the lane road lays it out. A kernel that only keeps the group stands in for
/// the decoding one.
class LaidOut {
  public:
    LaidOut(std::size_t width, std::uint32_t K, std::uint32_t threads)
        : itsKernel{width, {keep, keep, keep}, {keep, keep, keep}},
          itsCandidate{"layout", [] { return true; }, &itsKernel, 1},
          itsDecoder(threads, itsCandidate),
          itsBlocks(K, width) {
        const std::unique_ptr<TInterleaver> interleaver(TInterleaver::create("3GPPLTE"));
        itsDecoder.prepare(K, *interleaver);
        std::vector<LaneBlock> blocks;
        for (std::size_t i = 0; i < width; ++i) {
            const auto& in = itsBlocks.inputs[i];
            blocks.push_back({{in.rsc1_sys, in.rsc1_par, in.rsc2_par}, itsBlocks.outputs[i].dout});
        }
        itsDecoder.decode(K, iterations, 1, std::span(blocks).first(width / lanes::sliceLanes));
        itsGroup = kept;
    }

    const LaneGroup& group() const { return itsGroup; }

  private:
    inline static LaneGroup kept;
    static bool keep(const LaneGroup& group) {
        kept = group;
        return false;
    }

    lanes::LaneKernel itsKernel;
    lanes::Candidate itsCandidate;
    LaneDecoder itsDecoder;
    Blocks itsBlocks;
    LaneGroup itsGroup;
};

using Kernel = void (*)(const LaneGroup&);

void measure(benchmark::State& bench, const LaneKernels& kernels, Kernel kernel) {
    const LaidOut laidOut(kernels.width, static_cast<std::uint32_t>(bench.range(0)),
                          static_cast<std::uint32_t>(bench.range(1)) * 4);
    const LaneGroup& group = laidOut.group();
    // In the order of a decode, so that each works on values that the one before has made.
    kernels.readInputs(group);
    kernels.forward[1](group);
    kernels.backward[1](group);
    for (auto _ : bench) {
        kernel(group);
        benchmark::ClobberMemory();
    }
    const auto rows =
        static_cast<double>(group.steps * group.slices) * static_cast<double>(bench.iterations());
    bench.counters["row"] =
        benchmark::Counter(rows, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
    bench.counters["bit"] = benchmark::Counter(rows * static_cast<double>(kernels.width),
                                               benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
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
