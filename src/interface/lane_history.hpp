// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <functional>
#include <map>

#include "lanes/lane_decode.hpp"

class TDecoder3GPU;

namespace quarzel {

/// The blocks decoded in lanes whose metrics literal decodes would have left in the decoder's store. A trace
/// shows what is left there at the termination steps, which no pass of the parallel decoder computes.
///
/// A block covers what those of its size and below left before it. So one block of each size, at most, is of
/// interest, and of two the larger one is the older.
class LaneHistory {
  public:
    /// Keep the last block of the lanes, unless a block of `next` bits, which follows, covers it.
    void keep(const LaneDecoder& lanes, std::uint32_t next);

    /// Decode the blocks that are kept again, literally and without a message. The decoder's settings are
    /// restored afterwards, even if memory runs out. Then nothing is kept any more.
    /// @param lanes      the lanes that decoded them
    /// @param algorithm  their algorithm type
    void replay(TDecoder3GPU& decoder, const LaneDecoder& lanes, int algorithm);

    void forget();

  private:
    struct Record {
        bool live = false;
        LaneRows rows;  ///< its memory is used again
    };
    std::map<std::uint32_t, Record, std::greater<>> itsRecords;  ///< by size, largest first
};

}  // namespace quarzel
