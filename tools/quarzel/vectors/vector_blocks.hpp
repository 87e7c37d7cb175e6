// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <vector>

#include "vectors/manifest.hpp"

namespace quarzel::tool {

/// What the cores of a set with one number of units are given.
struct CoreStimulus {
    std::vector<VectorBlock> blocks;  ///< not in captures yet
    /// The 3 (K + 4) soft values of block i. It may be called from several threads at once.
    std::function<std::vector<std::int8_t>(std::size_t i)> soft;
};

/// A block of a set: what goes into the core and what comes out.
struct StimulusAndResponse {
    std::vector<std::int8_t> soft;         ///< 3 (K + 4) values
    std::vector<unsigned char> decisions;  ///< K bits
};

/// Make the blocks of a stimulus and decode them.
/// @param threads   how many threads do so; the result is the same
/// @param progress  told one after the other, by any of the threads, how many blocks are made; what it throws
///                  ends the work and is passed on
/// @throws ToolError when one cannot be decoded
std::vector<StimulusAndResponse> makeBlocks(const CoreStimulus& stimulus, int units, int algorithm,
                                            unsigned threads,
                                            const std::function<void(std::size_t)>& progress);

}  // namespace quarzel::tool
