// SPDX-License-Identifier: MIT
#include "lanes/lanes.hpp"

namespace quarzel::lanes {

extern const LaneKernel baselineKernels[1];

#if defined(__x86_64__)
extern const LaneKernel sse41Kernels[1];
extern const LaneKernel avx2Kernels[2];
extern const LaneKernel avx512bwKernels[3];
#endif

namespace {

/// What every processor of its kind runs: vectors of 128 bits, however the machine makes them.
#if defined(__aarch64__)
constexpr const char* everywhere = "neon";
#else
constexpr const char* everywhere = "baseline";
#endif

constexpr Candidate list[] = {
#if defined(__x86_64__)
    {"avx512bw",
     [] {
         return __builtin_cpu_supports("avx512bw") != 0 && __builtin_cpu_supports("avx512vl") != 0 &&
                __builtin_cpu_supports("avx512dq") != 0;
     },
     avx512bwKernels, 3},
    {"avx2", [] { return __builtin_cpu_supports("avx2") != 0; }, avx2Kernels, 2},
    {"sse4.1", [] { return __builtin_cpu_supports("sse4.1") != 0; }, sse41Kernels, 1},
#endif
    {everywhere, [] { return true; }, baselineKernels, 1},
};

}  // namespace

CandidateList candidates() {
    return {list, sizeof list / sizeof *list};
}

const Candidate& bestCandidate() {
    const Candidate* candidate = list;
    while (!candidate->supported()) {
        ++candidate;
    }
    return *candidate;
}

}  // namespace quarzel::lanes
