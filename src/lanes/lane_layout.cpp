// SPDX-License-Identifier: MIT
#include "lanes/lane_layout.hpp"

#include <algorithm>

namespace quarzel {

using lanes::sliceLanes;

std::uint16_t ShuffleSet::indexOf(const lanes::Shuffle& shuffle) {
    const auto found = std::find_if(itsShuffles.begin(), itsShuffles.end(), [&](const lanes::Shuffle& known) {
        return std::equal(std::begin(known.bytes), std::end(known.bytes), std::begin(shuffle.bytes));
    });
    if (found == itsShuffles.end()) {
        itsShuffles.push_back(shuffle);
        return static_cast<std::uint16_t>(itsShuffles.size() - 1);
    }
    return static_cast<std::uint16_t>(found - itsShuffles.begin());
}

namespace {

/// @return false when a row's lanes come from more than one row, or a slice's from more than one slice
bool findSources(const LaneLayout& layout, const std::vector<std::uint32_t>& permutation,
                 ShuffleSet& shuffles, LaneLayout::Sources& sources) {
    const std::uint32_t slices = layout.slices();
    sources.row.reserve(layout.steps);
    sources.slices.reserve(std::size_t{layout.steps} * slices);
    // The position that a lane of row t reads.
    const auto positionOf = [&](std::uint32_t slice, std::uint32_t lane, std::uint32_t t) {
        return permutation[std::size_t{layout.segmentOf(slice, lane)} * layout.steps + t];
    };
    for (std::uint32_t t = 0; t < layout.steps; ++t) {
        const std::uint32_t row = permutation[t] % layout.steps;
        sources.row.push_back(static_cast<std::uint16_t>(row));
        for (std::uint32_t slice = 0; slice < slices; ++slice) {
            const std::uint32_t sourceSlice = positionOf(slice, 0, t) / layout.steps % slices;
            lanes::Shuffle shuffle{};
            for (std::uint32_t lane = 0; lane < sliceLanes; ++lane) {
                const std::uint32_t position = positionOf(slice, lane, t);
                const std::uint32_t segment = position / layout.steps;
                if (position % layout.steps != row || segment % slices != sourceSlice) {
                    return false;
                }
                const std::uint32_t source = layout.segments >= sliceLanes
                                                 ? segment / slices
                                                 : layout.blockOf(lane) * layout.segments + segment;
                const std::size_t byte = std::size_t{2} * lane;
                shuffle.bytes[byte] = static_cast<std::uint8_t>(2 * source);
                shuffle.bytes[byte + 1] = static_cast<std::uint8_t>(2 * source + 1);
            }
            sources.slices.push_back({static_cast<std::uint16_t>(sourceSlice), shuffles.indexOf(shuffle)});
        }
    }
    return true;
}

}  // namespace

std::optional<LaneLayout> makeLaneLayout(const LaneSchedule& schedule, ShuffleSet& shuffles) {
    const std::vector<std::uint32_t>& permutation = schedule.permutation;
    const auto K = static_cast<std::uint32_t>(permutation.size());
    LaneLayout layout{K, schedule.segments, K / schedule.segments, schedule.windowLength, {}, {}};
    std::vector<std::uint32_t> inverse(K);
    for (std::uint32_t i = 0; i < K; ++i) {
        inverse[permutation[i]] = i;
    }
    if (!findSources(layout, permutation, shuffles, layout.interleaved) ||
        !findSources(layout, inverse, shuffles, layout.natural)) {
        return std::nullopt;
    }
    return layout;
}

}  // namespace quarzel
