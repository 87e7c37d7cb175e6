// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <span>
#include <vector>

#include "lanes/lane_layout.hpp"
#include "lanes/lanes.hpp"

namespace quarzel {

/// A code block as its caller holds it: three streams of K + 4 values in units of the input format, and room
/// for K decisions.
struct LaneBlock {
    const void* streams[3];
    unsigned char* bits;
};

/// Blocks that are decoded by one call.
struct LaneCall {
    std::span<const LaneBlock> blocks;
    std::size_t valueBytes;          ///< bytes of a soft value, which is a signed integer: 1, 2 or 4
    unsigned iterations;             ///< at least 1
    std::ptrdiff_t iterationStride;  ///< bytes from the decisions after an iteration to those after the next
                                     ///< one; 0: only those after the last iteration are written
};

/// The soft values of a decoded block, as lanes hold them.
struct LaneRows {
    std::uint32_t K = 0;
    unsigned iterations = 0;
    std::size_t index = 0;        ///< of the block in its group
    std::size_t sliceWords = 0;   ///< as in its LaneGroup
    std::size_t rowWords = 0;     ///< as in its LaneGroup
    std::size_t streams[3] = {};  ///< where the rows of each stream begin
    std::size_t tail = 0;         ///< where the tail begins
    std::vector<std::int16_t> words;
};

/// Decodes groups of blocks of one size with a lane for every thread segment. It gives the decisions of the
/// parallel decoder with the formats Fix_12_3 and Fix_8_3.
class LaneDecoder {
  public:
    /// @param algorithm  0 max-log, 1 max-log with scaled extrinsics, 2 max-star with the 16-point table
    /// @param candidate  the instruction set; not copied
    LaneDecoder(int algorithm, const lanes::Candidate& candidate)
        : itsAlgorithm(algorithm), itsCandidate(&candidate) {}

    /// Decode by another instruction set from now on.
    void choose(const lanes::Candidate& candidate) { itsCandidate = &candidate; }

    const lanes::Candidate& candidate() const { return *itsCandidate; }

    bool knows(std::uint32_t K) const { return itsLayouts.contains(K); }

    /// Make ready for a block size.
    /// @return false when the size cannot be laid out
    bool add(const LaneSchedule& schedule);

    /// Decode blocks of a known size.
    /// @return whether a soft value was saturated
    bool decode(std::uint32_t K, const LaneCall& call);

    /// Size of the last block decoded, 0 when there is none.
    std::uint32_t lastSize() const { return itsLast.K; }

    void forgetLast() { itsLast.K = 0; }

    /// Copy the rows of the last block decoded.
    void keepLast(LaneRows& rows) const;

    /// The decoder's soft values of a block: position by position systematic, parity 1, parity 2.
    std::vector<std::int16_t> softValues(const LaneRows& rows) const;

  private:
    enum class Fill { bundles, slices, states };  ///< what the lanes of a vector hold
    struct Plan {
        const lanes::LaneKernel* kernel;
        Fill fill;
        std::uint32_t bundles;
    };
    struct Last {
        std::uint32_t K = 0;
        unsigned iterations = 0;
        std::size_t index = 0;  ///< in its group
    };

    Plan plan(const LaneLayout& layout, std::size_t blocks) const;
    void shareStore(const LaneLayout& layout, const Plan& plan);
    void placeBlock(const LaneLayout& layout, const LaneBlock& block, std::size_t index,
                    std::size_t valueBytes);
    bool decodeGroup(const LaneLayout& layout, const Plan& plan, const LaneCall& call);

    int itsAlgorithm;
    const lanes::Candidate* itsCandidate;
    ShuffleSet itsShuffles;
    std::map<std::uint32_t, LaneLayout> itsLayouts;
    std::vector<std::int16_t> itsStore;
    lanes::LaneGroup itsGroup = {};  ///< the last one, inside the store
    std::vector<const void*> itsInputs;
    std::vector<unsigned char*> itsOutputs;
    Last itsLast;
};

}  // namespace quarzel
