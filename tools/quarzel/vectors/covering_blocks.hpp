// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "vectors/vector_plan.hpp"

namespace quarzel::tool {

/// A block chosen for the faults that its decisions and its tag give away. Its soft values are those of a set
/// with seed 1 and the standard quantiser.
struct CoveringBlock {
    PlannedBlock planned;
    int decibels;  ///< Eb/N0 of the noise
    unsigned tag;  ///< 8 bits
};

/// How many faults of a core a set finds.
struct CoveringScore {
    std::size_t found;         ///< of the catalogue that the blocks were chosen for
    std::size_t of;            ///< those of the catalogue that some block can find
    std::size_t equivalent;    ///< those that no block can find
    std::size_t heldOutFound;  ///< of the faults that no block was chosen for
    std::size_t heldOutOf;
};

/// The covering blocks of a core, in the order in which a bench is to run them: some faults show in what a
/// block leaves for the next one.
/// @param units      2, 4 or 8
/// @param algorithm  0, 1 or 2
std::vector<CoveringBlock> coveringBlocks(int units, int algorithm);

/// What these blocks find, run in their order.
CoveringScore coveringScore(int units, int algorithm);

/// The 3 (K + 4) soft values of a covering block.
std::vector<std::int8_t> softValuesOf(const CoveringBlock& block, int units);

}  // namespace quarzel::tool
