// SPDX-License-Identifier: MIT
#pragma once

#include <utility>

#include "engine/tail_metrics.hpp"
#include "lanes/lane_word.hpp"

// Where recursions start and end, and what segments hand to their neighbours.
namespace quarzel::lanes {
namespace {

using trellis::states;

template <std::size_t W>
using Metrics = StateWords<Lanes<W>>;

template <std::size_t W>
inline Lanes<W> largest(const Metrics<W>& m) {
    return max(max(max(m[0], m[1]), max(m[2], m[3])), max(max(m[4], m[5]), max(m[6], m[7])));
}

template <std::size_t W>
inline Metrics<W> loadMetrics(const std::int16_t* from, std::size_t stride) {
    Metrics<W> m;
    unrolled<states>([&](auto state) { m[state] = Lanes<W>::load(from + state * stride); });
    return m;
}

template <std::size_t W>
inline void storeMetrics(const Metrics<W>& m, std::int16_t* to, std::size_t stride) {
    unrolled<states>([&](auto state) { m[state].store(to + state * stride); });
}

/// Metrics as a boundary: low bits cleared and, where metrics are kept from wrapping, the largest one at 0.
template <bool Normalised, std::size_t W>
inline Metrics<W> toBoundary(Metrics<W> m) {
    unrolled<states>([&](auto state) { m[state] = m[state] & Lanes<W>::of(boundaryMask); });
    if constexpr (Normalised) {
        const Lanes<W> top = largest<W>(m);
        unrolled<states>([&](auto state) { m[state] = sub(m[state], top); });
    }
    return m;
}

/// The masked lanes from one place, the others from another.
template <std::size_t W>
inline Lanes<W> choose(Lanes<W> mask, Lanes<W> where, Lanes<W> elsewhere) {
    return {(mask.v & where.v) | (~mask.v & elsewhere.v)};
}

/// The backward metrics that the tail slices of a bundle give for a code.
inline Metrics<8> tailMetricsOf(const LaneGroup& group, std::size_t bundle, std::size_t code) {
    const auto value = [&](std::size_t number) {
        return Lanes<8>::load(group.tail + (bundle * tailSlices + 6 * code + number) * sliceLanes);
    };
    return tailMetrics<Lanes<8>>({{value(0), value(2), value(4)}, {value(1), value(3), value(5)}, {}});
}

/// The first word of a slice in a row of metrics.
inline std::size_t metricWord(const LaneGroup& group, std::size_t metric, std::size_t slice,
                              std::size_t bundle) {
    return sliceLanes * ((metric * group.slices + slice) * group.bundles + bundle);
}

/// What a block starts with in the states that it does not start in: half of the smallest metric.
constexpr std::int16_t otherState = -32768 / 2;

/// The starts of the first passes: a block's first forward one is state 0, its last backward one comes from
/// its tail, and of the others nothing is known.
template <bool Normalised>
inline void setStarts(const LaneGroup& group) {
    constexpr Lanes<8> unknown{};
    const std::size_t words = metricWord(group, states, 0, 0);
    const Lanes<8> first = Lanes<8>::load(group.firstSegment);
    const Lanes<8> last = Lanes<8>::load(group.lastSegment);
    for (std::size_t code = 0; code < 2; ++code) {
        std::int16_t* const alpha = group.alphaStart[code];
        std::int16_t* const beta = group.betaStart[code];
        std::int16_t* const lastBeta = beta + (group.windows - 1) * words;
        std::memset(alpha, 0, words * sizeof *alpha);
        std::memset(beta, 0, group.windows * words * sizeof *beta);
        for (std::size_t bundle = 0; bundle < group.bundles; ++bundle) {
            const Metrics<8> known = toBoundary<Normalised, 8>(tailMetricsOf(group, bundle, code));
            unrolled<states>([&](auto state) {
                const Lanes<8> start = Lanes<8>::of(state == 0 ? 0 : otherState);
                choose(first, start, unknown).store(alpha + metricWord(group, state, 0, bundle));
                choose(last, known[state], unknown)
                    .store(lastBeta + metricWord(group, state, group.slices - 1, bundle));
            });
        }
    }
}

/// Lane i of every slice receives what lane i + From had, around the slice.
template <std::size_t From, std::size_t... Lane>
inline Lanes<sizeof...(Lane)> rotated(Lanes<sizeof...(Lane)> x, std::index_sequence<Lane...>) {
    return {
        __builtin_shufflevector(x.v, x.v, (Lane / sliceLanes * sliceLanes + (Lane + From) % sliceLanes)...)};
}

/// Move boundaries to the segments next to them: to another slice or, around the slices, to another lane.
/// Masked lanes keep theirs.
/// @tparam W   lanes of neighbouring bundles that are moved at once
/// @tparam Up  whether they move to the segments above
template <std::size_t W, bool Up>
inline void hand(const LaneGroup& group, const std::int16_t* ends, const std::int16_t* keeps,
                 std::int16_t* starts) {
    const std::size_t sliceWords = sliceLanes * group.bundles;
    const std::size_t topSlice = (group.slices - 1) * sliceWords;
    const Lanes<W> mask = repeated<W>(Lanes<8>::load(keeps));
    for (std::size_t metric = 0; metric < states; ++metric) {
        const std::int16_t* const from = ends + metricWord(group, metric, 0, 0);
        std::int16_t* const to = starts + metricWord(group, metric, 0, 0);
        for (std::size_t word = 0; word < topSlice; word += W) {
            Lanes<W>::load(from + (Up ? 0 : sliceWords) + word).store(to + (Up ? sliceWords : 0) + word);
        }
        const std::int16_t* const leaving = from + (Up ? topSlice : 0);
        std::int16_t* const entered = to + (Up ? 0 : topSlice);
        for (std::size_t word = 0; word < sliceWords; word += W) {
            constexpr std::size_t neighbour = Up ? sliceLanes - 1 : 1;
            const Lanes<W> moved =
                rotated<neighbour>(Lanes<W>::load(leaving + word), std::make_index_sequence<W>());
            choose(mask, Lanes<W>::load(entered + word), moved).store(entered + word);
        }
    }
}

/// Start each segment where the one below it ended; a block's first one keeps its start.
template <std::size_t W>
inline void handUp(const LaneGroup& group, std::int16_t* starts) {
    hand<W, true>(group, group.alphaState, group.firstSegment, starts);
}

/// Start the last window of each segment where the first one of the segment above it ended; a block's last
/// one keeps its start.
template <std::size_t W>
inline void handDown(const LaneGroup& group, std::int16_t* starts) {
    hand<W, false>(group, group.boundary, group.lastSegment, starts);
}

}  // namespace
}  // namespace quarzel::lanes
