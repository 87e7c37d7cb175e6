// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "captures/capture_file.hpp"
#include "link/chain/coded_link.hpp"
#include "vectors/stimulus.hpp"

namespace quarzel::tool {

/// What a set is to reach by itself.
enum class Cover : std::uint8_t {
    nothing,  ///< its blocks are the user's choice
    faults,   ///< the faults that covering_blocks.csv was chosen for
    sizes,    ///< every block size, once with each of the iterations in turn, and all stimuli
};

/// What the user of a vector set chooses.
struct VectorRequest {
    std::vector<std::uint32_t> blockSizes;  ///< K
    std::vector<int> units;
    std::vector<int> algorithms;
    std::vector<int> iterations;
    std::vector<Stimulus> stimuli;
    std::size_t blocks = 0;  ///< of each stimulus
    Cover cover = Cover::nothing;
    link::Decibels ebN0;  ///< of the noise
    link::Quantiser quantiser;
    bool isScaled = false;  ///< the quantiser makes soft values of the capture's real numbers
    std::uint64_t seed = 1;
    std::optional<link::LinkSetup> link;     ///< makes the blocks, instead of stimuli for block sizes
    std::shared_ptr<const Capture> capture;  ///< has the blocks, instead of stimuli; null: there is none
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
/// A set that covers the sizes has for every K blocks with noise and one of the other stimuli in turn. The
/// smallest and the greatest K of each number of thread segments have all stimuli. One that covers faults is
/// not planned here, but in covering_blocks.csv.
std::vector<PlannedBlock> planBlocks(const VectorRequest& request, std::uint32_t units);

}  // namespace quarzel::tool
