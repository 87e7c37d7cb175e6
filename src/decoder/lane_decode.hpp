// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <map>
#include <span>
#include <vector>

#include "decoder/lane_layout.hpp"
#include "engine/lanes/lanes.hpp"

class TInterleaver;

namespace quarzel {

/// A code block as its caller holds it: three streams of K + 4 values in units of the input format, and room
/// for K decisions.
struct LaneBlock {
    const int* streams[3];
    unsigned char* bits;
};

/// The fast road: decodes groups of blocks of one size with a lane for every thread segment. It gives the
/// decisions of the parallel decoder with the formats Fix_12_3 and Fix_8_3.
class LaneDecoder {
  public:
    /// @param threads    processing units times threads per unit
    /// @param candidate  the instruction set
    LaneDecoder(std::uint32_t threads, const lanes::Candidate& candidate)
        : itsThreads(threads), itsCandidate(&candidate) {}

    /// Make ready for a block size: lay it out when it is the first of its size.
    /// @return false when the size cannot be laid out
    bool prepare(std::uint32_t K, const TInterleaver& interleaver);

    /// Decode blocks of a size that `prepare` took.
    /// @param algorithm  0 max-log, 1 max-log with scaled extrinsics, 2 max-star with the 16-point table
    /// @return whether a soft value was saturated
    bool decode(std::uint32_t K, unsigned iterations, int algorithm, std::span<const LaneBlock> blocks);

    /// Size of the last block decoded, 0 before the first, and its iterations.
    std::uint32_t lastSize() const { return itsLast.K; }
    unsigned lastIterations() const { return itsLast.iterations; }

    void forgetLast() { itsLast.K = 0; }

    /// Read the last block decoded back, as the decoder's soft values in units of the input format.
    void readLast(std::vector<std::int8_t>& soft) const;

  private:
    struct Plan {
        const lanes::LaneKernel* kernel;
        bool acrossOctets;
        std::uint32_t bundles;
    };
    struct Last {
        std::uint32_t K = 0;
        unsigned iterations = 0;
        std::size_t index = 0;  ///< in its group
    };

    Plan plan(const LaneLayout& layout, std::size_t blocks) const;
    void shareStore(const LaneLayout& layout, std::size_t width);
    void placeBlock(const LaneLayout& layout, const LaneBlock& block, std::size_t index);
    bool decodeGroup(const LaneLayout& layout, const Plan& plan, unsigned iterations, int algorithm,
                     std::span<const LaneBlock> blocks);

    std::uint32_t itsThreads;
    const lanes::Candidate* itsCandidate;
    ShuffleSet itsShuffles;
    std::map<std::uint32_t, LaneLayout> itsLayouts;
    std::vector<std::int16_t> itsStore;
    lanes::LaneGroup itsGroup = {};  ///< the last one, inside the store
    std::vector<const int*> itsInputs;
    std::vector<unsigned char*> itsOutputs;
    Last itsLast;
};

}  // namespace quarzel
