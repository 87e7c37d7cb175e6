// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "link/chain/coded_link.hpp"
#include "vectors/stimulus.hpp"

namespace quarzel::tool {

/// What the user of a vector set chooses.
struct VectorRequest {
    std::vector<std::uint32_t> blockSizes;  ///< K
    std::vector<int> units;
    std::vector<int> algorithms;
    std::vector<int> iterations;
    std::vector<Stimulus> stimuli;
    std::size_t blocks = 0;  ///< of each stimulus
    bool cover = false;      ///< every block size once with each of its iterations in turn, and all stimuli
    link::Decibels ebN0;     ///< of the noise
    link::Quantiser quantiser;
    std::uint64_t seed = 1;
    std::optional<link::LinkSetup> link;  ///< makes the blocks, instead of stimuli for block sizes
};

/// A block of a set before it is made.
struct PlannedBlock {
    std::uint32_t blockSize;  ///< K
    int iterations;
    Stimulus stimulus;
    std::uint32_t number;  ///< among the blocks of this K and stimulus that differ, from 0
};

/// The blocks for a core with this many units, in their order.
///
/// A set that covers has for every K blocks with noise and one of the other stimuli in turn. The smallest and
/// the greatest K of each number of thread segments have all stimuli.
std::vector<PlannedBlock> planBlocks(const VectorRequest& request, std::uint32_t units);

}  // namespace quarzel::tool
