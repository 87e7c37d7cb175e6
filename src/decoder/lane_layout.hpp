// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "engine/lanes/lane_group.hpp"

namespace quarzel {

/// The distinct shuffles of all layouts of a decoder.
class ShuffleSet {
  public:
    /// The index of a shuffle, which is added when it is new.
    std::uint16_t indexOf(const lanes::Shuffle& shuffle);

    const lanes::Shuffle* data() const { return itsShuffles.data(); }

  private:
    std::vector<lanes::Shuffle> itsShuffles;
};

/// How the lanes of a block size are laid out, and how the permutation between the codes moves them.
struct LaneLayout {
    /// For each row of a code, where its lanes are found in the rows of the other code.
    struct Sources {
        std::vector<std::uint16_t> row;
        std::vector<lanes::OctetSource> octets;
    };

    static constexpr std::uint32_t octetLanes = lanes::octetLanes;

    std::uint32_t K;
    std::uint32_t segments;  ///< thread segments of a block
    std::uint32_t steps;     ///< trellis steps of a segment
    std::vector<std::uint16_t> windowLength;
    Sources natural;
    Sources interleaved;

    std::uint32_t octets() const { return segments >= octetLanes ? segments / octetLanes : 1; }
    std::uint32_t blocksPerBundle() const { return segments >= octetLanes ? 1 : octetLanes / segments; }
    /// The segment in a lane of an octet, and the block of the bundle that it belongs to.
    std::uint32_t segmentOf(std::uint32_t octet, std::uint32_t lane) const {
        return segments >= octetLanes ? lane * octets() + octet : lane % segments;
    }
    std::uint32_t blockOf(std::uint32_t lane) const { return segments >= octetLanes ? 0 : lane / segments; }

    /// Call `visit(octet, lane)` for the segments of a block, in their order.
    /// @param index  of the block in its group
    template <class Visit>
    void forEachSegment(std::size_t index, Visit visit) const {
        const std::size_t first = index % blocksPerBundle() * segments;
        const std::size_t lanes = segments / octets();
        for (std::size_t lane = first; lane < first + lanes; ++lane) {
            for (std::size_t octet = 0; octet < octets(); ++octet) {
                visit(octet, lane);
            }
        }
    }
};

/// Lay out a block size.
///
/// @param permutation  of K entries: the natural position read at each interleaved one
/// @param segments     thread segments, a power of two that divides K
/// @return nothing when the permutation does not keep the rows and octets of such a layout. A quadratic
///         permutation polynomial keeps them.
std::optional<LaneLayout> makeLaneLayout(const std::vector<std::uint32_t>& permutation,
                                         std::uint32_t segments, ShuffleSet& shuffles);

}  // namespace quarzel
