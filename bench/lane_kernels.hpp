// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

#include "lanes/lane_group.hpp"

namespace quarzel::bench {

/// What the method costs at least: the trellis steps of a pass of type 1, forward and backward, in loops of
/// nothing else, over rows that stay in the first-level cache.
struct Limit {
    const char* name;
    /// Go over that many rows, a multiple of limitRows.
    /// @param memory  limitRows * limitVectors vectors
    void (*run)(std::size_t rows, std::int16_t* memory);
};

inline constexpr std::size_t limitRows = 32;
inline constexpr std::size_t limitVectors = 12;

/// The kernels of one instruction set, each over a whole group. The order of the calls is theirs in a decode,
/// once all have been called; alone they work on what is stored.
struct LaneKernels {
    std::size_t width;                             ///< lanes of a vector
    void (*readInputs)(const lanes::LaneGroup&);   ///< conversion, saturation, split into lane rows, starts
    void (*forward[3])(const lanes::LaneGroup&);   ///< one pass, by algorithm type: interleaving, alpha
    void (*backward[3])(const lanes::LaneGroup&);  ///< one pass: beta, LLR, extrinsic
    void (*writeDecisions)(const lanes::LaneGroup&);  ///< decisions, packed into the caller's bytes
    Limit limits[4];
};

}  // namespace quarzel::bench
