// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

#include "lanes/lane_group.hpp"

namespace quarzel::bench {

/// The kernels of one instruction set, each over a whole group. The order of the calls is theirs in a decode,
/// once all have been called; alone they work on what is stored.
struct LaneKernels {
    std::size_t width;                             ///< lanes of a vector
    void (*readInputs)(const lanes::LaneGroup&);   ///< conversion, saturation, split into lane rows, starts
    void (*forward[3])(const lanes::LaneGroup&);   ///< one pass, by algorithm type: interleaving, alpha
    void (*backward[3])(const lanes::LaneGroup&);  ///< one pass: beta, LLR, extrinsic
    void (*writeDecisions)(const lanes::LaneGroup&);  ///< decisions, packed into the caller's bytes
};

}  // namespace quarzel::bench
