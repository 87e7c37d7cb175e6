// SPDX-License-Identifier: MIT
#pragma once

#include <mex.h>

#include <array>
#include <cstdint>
#include <list>
#include <span>
#include <vector>

#include "common/host_core.hpp"

namespace quarzel::octave {

/// The blocks of three arguments, and an array for their bits in the same form: a vector is a block, a matrix
/// has a block in each column, a cell array one in each cell.
class MexBlocks {
  public:
    /// @param streams  systematic, parity 1, parity 2
    /// @throws bindings::BindingError when types or shapes are not right
    explicit MexBlocks(const std::array<const mxArray*, 3>& streams);

    /// How many there are.
    std::size_t count() const;

    /// Decode them.
    /// @param tags  one for each block, comes back masked
    bindings::Outcome decode(bindings::HostCore& core, int iterations, std::span<unsigned> tags,
                             const bindings::HostCore::Interrupted& interrupted) const;

    /// Decode the only block with a trace, as text in the outcome.
    /// @throws bindings::BindingError when there are more or none
    bindings::Outcome trace(bindings::HostCore& core, int iterations, std::span<unsigned> tags,
                            unsigned passes) const;

    /// The array for the bits; uint8, or cells of that. It belongs to the caller.
    mxArray* bits() const { return itsBits; }

  private:
    /// A matrix of each stream: blocks of one size.
    struct Matrix {
        bindings::ArrayBlocks blocks;
        std::span<unsigned char> bits;
    };

    mxArray* addMatrix(const std::array<const mxArray*, 3>& streams);

    std::vector<Matrix> itsMatrices;                 ///< one, or one for each cell
    std::list<std::vector<std::int16_t>> itsWholes;  ///< what came as real numbers
    mxArray* itsBits;
};

}  // namespace quarzel::octave
