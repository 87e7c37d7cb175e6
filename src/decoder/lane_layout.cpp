// SPDX-License-Identifier: MIT
#include "decoder/lane_layout.hpp"

#include <algorithm>

#include "decoder/segments.hpp"

namespace quarzel {

using lanes::octetLanes;

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

/// @return false when a row's lanes come from more than one row, or an octet's from more than one octet
bool findSources(const LaneLayout& layout, const std::vector<std::uint32_t>& permutation,
                 ShuffleSet& shuffles, LaneLayout::Sources& sources) {
    const std::uint32_t octets = layout.octets();
    sources.row.reserve(layout.steps);
    sources.octets.reserve(std::size_t{layout.steps} * octets);
    // The position that a lane of row t reads.
    const auto positionOf = [&](std::uint32_t octet, std::uint32_t lane, std::uint32_t t) {
        return permutation[std::size_t{layout.segmentOf(octet, lane)} * layout.steps + t];
    };
    for (std::uint32_t t = 0; t < layout.steps; ++t) {
        const std::uint32_t row = permutation[t] % layout.steps;
        sources.row.push_back(static_cast<std::uint16_t>(row));
        for (std::uint32_t octet = 0; octet < octets; ++octet) {
            const std::uint32_t sourceOctet = positionOf(octet, 0, t) / layout.steps % octets;
            lanes::Shuffle shuffle{};
            for (std::uint32_t lane = 0; lane < octetLanes; ++lane) {
                const std::uint32_t position = positionOf(octet, lane, t);
                const std::uint32_t segment = position / layout.steps;
                if (position % layout.steps != row || segment % octets != sourceOctet) {
                    return false;
                }
                const std::uint32_t source = layout.segments >= octetLanes
                                                 ? segment / octets
                                                 : layout.blockOf(lane) * layout.segments + segment;
                const std::size_t byte = std::size_t{2} * lane;
                shuffle.bytes[byte] = static_cast<std::uint8_t>(2 * source);
                shuffle.bytes[byte + 1] = static_cast<std::uint8_t>(2 * source + 1);
            }
            sources.octets.push_back({static_cast<std::uint16_t>(sourceOctet), shuffles.indexOf(shuffle)});
        }
    }
    return true;
}

}  // namespace

std::optional<LaneLayout> makeLaneLayout(const std::vector<std::uint32_t>& permutation,
                                         std::uint32_t segments, ShuffleSet& shuffles) {
    const auto K = static_cast<std::uint32_t>(permutation.size());
    LaneLayout layout{K, segments, K / segments, {}, {}, {}};
    for (std::uint32_t rest = layout.steps; rest != 0; rest -= layout.windowLength.back()) {
        layout.windowLength.push_back(static_cast<std::uint16_t>(windowLength(rest)));
    }
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
