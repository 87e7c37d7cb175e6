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
inline constexpr std::size_t plusTarget[states] = {4, 0, 1, 5, 6, 2, 3, 7};

/// Where the branches of each state lead and come from, all derived from the table above.
struct Links {
    std::size_t plusTarget[states];    ///< target of the + branch
    std::size_t minusTarget[states];   ///< target of the - branch: the other of the two
    std::size_t plusSource[states];    ///< the state whose + branch arrives here
    std::size_t minusSource[states];   ///< the state whose - branch arrives here
    std::size_t branchMetric[states];  ///< index of the metric that both branches of a state carry
};

constexpr Links makeLinks() {
    Links links{};
    for (std::size_t state = 0; state < states; ++state) {
        const std::size_t plus = plusTarget[state];
        links.plusTarget[state] = plus;
        links.minusTarget[state] = plus ^ 4U;
        links.plusSource[plus] = state;
        links.minusSource[plus ^ 4U] = state;
        links.branchMetric[state] = state / 2;
    }
    return links;
}

inline constexpr Links links = makeLinks();

}  // namespace quarzel::trellis
