// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstdint>
#include <optional>
#include <vector>

#include "lanes/lane_group.hpp"

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
        std::vector<lanes::SliceSource> slices;
    };

    static constexpr std::uint32_t sliceLanes = lanes::sliceLanes;

    std::uint32_t K;
    std::uint32_t segments;  ///< thread segments of a block
    std::uint32_t steps;     ///< trellis steps of a segment
    std::vector<std::uint16_t> windowLength;
    Sources natural;
    Sources interleaved;

    std::uint32_t slices() const { return std::max(segments / sliceLanes, 1U); }
    std::uint32_t lanesOfBlock() const { return std::min(segments, sliceLanes); }
    std::uint32_t blocksPerBundle() const { return sliceLanes / lanesOfBlock(); }
    /// The segment in a lane of a slice, and the block of the bundle that it belongs to.
    std::uint32_t segmentOf(std::uint32_t slice, std::uint32_t lane) const {
        return segments >= sliceLanes ? lane * slices() + slice : lane % segments;
    }
    std::uint32_t blockOf(std::uint32_t lane) const { return lane / segments; }

    /// The bundle of a block of a group.
    std::size_t bundleOf(std::size_t index) const { return index * lanesOfBlock() / sliceLanes; }

    /// Call `visit(slice, lane)` for the segments of a block, in their order.
    /// @param index  of the block in its group
    template <class Visit>
    void forEachSegment(std::size_t index, Visit visit) const {
        const std::size_t first = index * lanesOfBlock() % sliceLanes;
        for (std::size_t lane = first; lane < first + lanesOfBlock(); ++lane) {
            for (std::size_t slice = 0; slice < slices(); ++slice) {
                visit(slice, lane);
            }
        }
    }
};

/// What there is to know of a block size.
struct LaneSchedule {
    std::vector<std::uint32_t> permutation;  ///< K entries: the natural position read at each interleaved one
    std::uint32_t segments;                  ///< thread segments, a power of two that divides K
    std::vector<std::uint16_t> windowLength;  ///< of each backward window of a segment, from the lowest up
};

/// Lay out a block size.
/// @return nothing when the permutation does not keep the rows and slices of such a layout. A quadratic
///         permutation polynomial keeps them.
std::optional<LaneLayout> makeLaneLayout(const LaneSchedule& schedule, ShuffleSet& shuffles);

}  // namespace quarzel
