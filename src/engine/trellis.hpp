// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>

/// The trellis of the 8-state constituent code (transfer function 1, (1 + D + D^3) / (1 + D^2 + D^3); 3GPP TS
/// 36.212, section 5.1.3.2.1).
///
/// Two branches leave each state p, to p/2 and to p/2 + 4. One carries +g[p/2], the branch of information bit
/// 1; the other carries -g[p/2]. The one table says where the + branch goes; the rest follows from it.
namespace quarzel::trellis {

inline constexpr std::size_t states = 8;

/// Target of the + branch of each state.
inline constexpr std::array<std::size_t, states> plusTarget = {4, 0, 1, 5, 6, 2, 3, 7};

/// Target of the - branch: the other of the two.
constexpr std::size_t minusTarget(std::size_t state) {
    return plusTarget[state] ^ 4U;
}

/// Index of the branch metric that both branches of a state carry.
constexpr std::size_t branchMetric(std::size_t state) {
    return state / 2;
}

/// The state whose + branch arrives at `state`.
constexpr std::size_t plusSource(std::size_t state) {
    std::size_t source = 0;
    while (plusTarget[source] != state) {
        ++source;
    }
    return source;
}

/// The state whose - branch arrives at `state`: the two sources of a state differ in their lowest bit.
constexpr std::size_t minusSource(std::size_t state) {
    return plusSource(state) ^ 1U;
}

}  // namespace quarzel::trellis
