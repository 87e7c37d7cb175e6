// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string_view>

#include "fixed/number_format.hpp"
#include "interface/lane_history.hpp"
#include "interface/state.hpp"
#include "lanes/lane_decode.hpp"

class TDecoder;

namespace quarzel {

/// The lanes of a state, and all that keeps them from being noticed.
class LaneImplementation {
  public:
    /// @param threads    of the core
    /// @param algorithm  type of its arithmetic
    LaneImplementation(unsigned threads, int algorithm)
        : itsThreads(threads), itsAlgorithm(algorithm), itsDecoder(algorithm, lanes::bestCandidate()) {}

    /// Decode by this instruction set from now on, or literally when it is null.
    void choose(const lanes::Candidate* candidate);

    /// The instruction set, or null.
    const lanes::Candidate* choice() const { return itsOn ? &itsDecoder.candidate() : nullptr; }

    /// Whether a state is as its creation left it in all that a decode depends on, and nobody waits for its
    /// passes.
    bool fits(const vardel_ip_quarzel_state& state) const;

    /// Whether there are lanes for blocks of K bits of a state that `fits`, whose permutation is the one that
    /// the interleaver has or would compute.
    bool fitsSize(const vardel_ip_quarzel_state& state, std::uint32_t K);

    /// Decode blocks of a size that fits.
    /// @return whether a soft value was saturated
    bool decode(vardel_ip_quarzel_state& state, std::uint32_t K, const LaneCall& call);

    /// Bring the store of a decoder, which is about to decode literally, and the tables of its interleaver to
    /// what literal decodes of all blocks so far would have left there.
    void settle(TDecoder& decoder);

  private:
    unsigned itsThreads;
    int itsAlgorithm;
    bool itsOn = true;
    LaneDecoder itsDecoder;
    LaneHistory itsHistory;
    const TDecoder* itsServed = nullptr;  ///< the decoder in whose stead the lanes have decoded
    std::uint64_t itsServedCount = 0;     ///< its count of blocks after the last of these
    TNumberFormat itsStateFormat{12, 3};
    TNumberFormat itsBranchFormat{8, 3};
};

/// The choice between the two ways to decode: lanes where nothing can tell them from a literal decode.
/// @param K  information bits of the block
bool takesLanes(const vardel_ip_quarzel_state& state, std::uint32_t K);

}  // namespace quarzel
