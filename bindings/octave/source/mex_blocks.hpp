// SPDX-License-Identifier: MIT
#pragma once

#include <mex.h>

#include <array>
#include <vector>

#include "common/soft_block.hpp"

namespace quarzel::octave {

/// The blocks of three arguments, and an array for their bits in the same form: a vector is a block, a matrix
/// has a block in each column, a cell array one in each cell.
class MexBlocks {
  public:
    /// @param streams  systematic, parity 1, parity 2
    /// @throws bindings::BindingError when types or shapes are not right
    explicit MexBlocks(const std::array<const mxArray*, 3>& streams);

    std::vector<bindings::SoftBlock>& blocks() { return itsBlocks; }

    /// The array for the bits; uint8, or cells of that. It belongs to the caller.
    mxArray* bits() const { return itsBits; }

  private:
    mxArray* addNumbers(const std::array<const mxArray*, 3>& streams);

    std::vector<bindings::SoftBlock> itsBlocks;
    mxArray* itsBits;
};

}  // namespace quarzel::octave
