// SPDX-License-Identifier: MIT
#pragma once

#include "engine/lanes/lane_word.hpp"
#include "engine/tail_metrics.hpp"

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
    for (Lanes<W>& metric : m) {
        metric = metric & Lanes<W>::of(boundaryMask);
    }
    if constexpr (Normalised) {
        const Lanes<W> top = largest<W>(m);
        for (Lanes<W>& metric : m) {
            metric = sub(metric, top);
        }
    }
    return m;
}

/// The lanes of an octet that a mask names from one place, the others from another.
inline Lanes<8> choose(const std::int16_t* mask, Lanes<8> where, Lanes<8> elsewhere) {
    const Lanes<8> m = Lanes<8>::load(mask);
    return {(m.v & where.v) | (~m.v & elsewhere.v)};
}

/// The backward metrics that the tail octets of a bundle give for a code.
inline Metrics<8> tailMetricsOf(const LaneGroup& group, std::size_t bundle, std::size_t code) {
    const auto value = [&](std::size_t number) {
        return Lanes<8>::load(group.tail + (bundle * tailOctets + 6 * code + number) * octetLanes);
    };
    return tailMetrics<Lanes<8>>({{value(0), value(2), value(4)}, {value(1), value(3), value(5)}, {}});
}

/// The first word of an octet in a row of metrics.
inline std::size_t metricWord(const LaneGroup& group, std::size_t metric, std::size_t octet,
                              std::size_t bundle) {
    return octetLanes * ((metric * group.octets + octet) * group.bundles + bundle);
}

/// The starts of the first passes: a block's first forward one is state 0, its last backward one comes from
/// its tail, and of the others nothing is known.
template <bool Normalised>
inline void setStarts(const LaneGroup& group) {
    constexpr std::int16_t otherState = -32768 / 2;  // half of the smallest metric
    constexpr Lanes<8> unknown{};
    const std::size_t words = metricWord(group, states, 0, 0);
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
                choose(group.firstSegment, start, unknown).store(alpha + metricWord(group, state, 0, bundle));
                choose(group.lastSegment, known[state], unknown)
                    .store(lastBeta + metricWord(group, state, group.octets - 1, bundle));
            });
        }
    }
}

/// Start each segment where the one below it ended; a block's first one keeps its start.
inline void handUp(const LaneGroup& group, std::int16_t* starts) {
    const std::size_t last = group.octets - 1;
    for (std::size_t metric = 0; metric < states; ++metric) {
        for (std::size_t bundle = 0; bundle < group.bundles; ++bundle) {
            for (std::size_t octet = 0; octet < last; ++octet) {
                Lanes<8>::load(group.alphaState + metricWord(group, metric, octet, bundle))
                    .store(starts + metricWord(group, metric, octet + 1, bundle));
            }
            const Lanes<8> top = Lanes<8>::load(group.alphaState + metricWord(group, metric, last, bundle));
            const Lanes<8> moved{__builtin_shufflevector(top.v, top.v, 7, 0, 1, 2, 3, 4, 5, 6)};
            std::int16_t* const first = starts + metricWord(group, metric, 0, bundle);
            choose(group.firstSegment, Lanes<8>::load(first), moved).store(first);
        }
    }
}

/// Start the last window of each segment where the first one of the segment above it ended; a block's last
/// one keeps its start.
inline void handDown(const LaneGroup& group, std::int16_t* starts) {
    const std::size_t last = group.octets - 1;
    for (std::size_t metric = 0; metric < states; ++metric) {
        for (std::size_t bundle = 0; bundle < group.bundles; ++bundle) {
            for (std::size_t octet = 0; octet < last; ++octet) {
                Lanes<8>::load(group.boundary + metricWord(group, metric, octet + 1, bundle))
                    .store(starts + metricWord(group, metric, octet, bundle));
            }
            const Lanes<8> low = Lanes<8>::load(group.boundary + metricWord(group, metric, 0, bundle));
            const Lanes<8> moved{__builtin_shufflevector(low.v, low.v, 1, 2, 3, 4, 5, 6, 7, 0)};
            std::int16_t* const end = starts + metricWord(group, metric, last, bundle);
            choose(group.lastSegment, Lanes<8>::load(end), moved).store(end);
        }
    }
}

}  // namespace
}  // namespace quarzel::lanes
