// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

#include "lanes/lane_group.hpp"

/// The instruction sets that the lanes are compiled for.
namespace quarzel::lanes {

struct Candidate {
    const char* name;
    bool (*supported)();        ///< whether this machine can run it
    const LaneKernel* kernels;  ///< by ascending width
    std::size_t kernelCount;
};

/// All candidates of this build, best first. The last one runs on every machine of its kind.
struct CandidateList {
    const Candidate* first;
    std::size_t count;
    const Candidate* begin() const { return first; }
    const Candidate* end() const { return first + count; }
};
CandidateList candidates();

/// The best candidate that this machine can run.
const Candidate& bestCandidate();

}  // namespace quarzel::lanes
