// SPDX-License-Identifier: MIT
#pragma once

#include "engine/trellis.hpp"
#include "lanes/lane_transpose.hpp"

// A trellis step with the eight states in the lanes of a slice: which state is where, and the shuffles that
// bring metrics along the branches.
namespace quarzel::lanes {
namespace {

using trellis::states;

/// The state in each lane. Halving a vector three times, the first half against the second, compares states
/// in the order of the hardware's tree: an odd one with the even one below it, then neighbouring pairs.
inline constexpr std::size_t stateInLane[states] = {1, 5, 3, 7, 0, 4, 2, 6};

constexpr std::size_t laneOfState(std::size_t state) {
    std::size_t lane = 0;
    while (stateInLane[lane] != state) {
        ++lane;
    }
    return lane;
}

/// The shuffle that gives each lane word `source(state in the lane)`.
template <class Source>
constexpr Shuffle shuffleOf(Source source) {
    Shuffle shuffle{};
    for (std::size_t lane = 0; lane < states; ++lane) {
        const std::size_t byte = 2 * source(stateInLane[lane]);
        shuffle.bytes[2 * lane] = static_cast<std::uint8_t>(byte);
        shuffle.bytes[2 * lane + 1] = static_cast<std::uint8_t>(byte + 1);
    }
    return shuffle;
}

/// Each lane receives what the lane of state `link[its state]` has.
constexpr Shuffle linked(const std::size_t (&link)[states]) {
    return shuffleOf([&link](std::size_t state) { return laneOfState(link[state]); });
}

/// Each lane receives the branch metric of a step: of the branches that leave its state, or arrive there.
/// @param step  of four whose two different metrics, same and opposite signs, stand in turns
constexpr Shuffle metricsOf(std::size_t step, bool arriving) {
    return shuffleOf([=](std::size_t state) {
        const std::size_t from = arriving ? trellis::links.plusSource[state] : state;
        const std::size_t metric = trellis::links.branchMetric[from];
        return 2 * step + (metric == 1 || metric == 2 ? 1 : 0);
    });
}

struct TrellisShuffles {
    Shuffle plusSource = linked(trellis::links.plusSource);
    Shuffle minusSource = linked(trellis::links.minusSource);
    Shuffle plusTarget = linked(trellis::links.plusTarget);
    Shuffle minusTarget = linked(trellis::links.minusTarget);
    Shuffle arriving[4] = {metricsOf(0, true), metricsOf(1, true), metricsOf(2, true), metricsOf(3, true)};
    Shuffle leaving[4] = {metricsOf(0, false), metricsOf(1, false), metricsOf(2, false), metricsOf(3, false)};
};
inline constexpr TrellisShuffles trellisShuffles;

inline Lanes<8> shuffled(Lanes<8> x, const Shuffle& shuffle) {
    return shuffleSlices(x, loadShuffle(shuffle));
}

/// The largest metric, in every lane.
inline Lanes<8> largestOf(Lanes<8> m) {
    m = max(m, {__builtin_shufflevector(m.v, m.v, 4, 5, 6, 7, 0, 1, 2, 3)});
    m = max(m, {__builtin_shufflevector(m.v, m.v, 2, 3, 0, 1, 6, 7, 4, 5)});
    return max(m, {__builtin_shufflevector(m.v, m.v, 1, 0, 3, 2, 5, 4, 7, 6)});
}

/// The largest path of each of eight steps, step i in lane i. Two vectors at a time become one of half the
/// states.
template <class Rule>
inline Lanes<8> bestOfEight(const Squares<8>& paths, const Rule& rule) {
    const auto halved = [&rule](Lanes<8> x, Lanes<8> y) {
        return rule.larger(interleaveLow(x, y), interleaveHigh(x, y));
    };
    const Lanes<8> even = halved(halved(paths[0], paths[4]), halved(paths[2], paths[6]));
    const Lanes<8> odd = halved(halved(paths[1], paths[5]), halved(paths[3], paths[7]));
    return halved(even, odd);
}

}  // namespace
}  // namespace quarzel::lanes
