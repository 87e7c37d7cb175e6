// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>

#include "engine/trellis.hpp"
#include "fixed/wrap16.hpp"

/// The arithmetic of ONE trellis step. Each function is a template over the rule of the maximum
/// (max_rules.hpp) and, through it, over the word: a 16-bit integer, or as many of them as a vector has
/// lanes.
namespace quarzel {

template <class Rule>
using StateMetrics = std::array<typename Rule::Metric, trellis::states>;

template <class Word>
using StateWords = std::array<Word, trellis::states>;

template <class Word>
using BranchMetrics = std::array<Word, 4>;

/// Branch metrics of one step: the four sign patterns of the two parities around twice the intrinsic value,
/// in full precision, clamped to [lo, hi]. This clamp is the only saturation of an engine.
constexpr BranchMetrics<std::int16_t> gammaStep(std::int32_t intrinsic, std::int32_t parity0,
                                                std::int32_t parity1, std::int16_t lo, std::int16_t hi) {
    const auto clamp = [lo, hi](std::int32_t value) {
        return wrap16(value > hi ? hi : std::max<std::int32_t>(value, lo));
    };
    return {clamp(2 * intrinsic + parity0 + parity1), clamp(2 * intrinsic - parity0 + parity1),
            clamp(2 * intrinsic - parity0 - parity1), clamp(2 * intrinsic + parity0 - parity1)};
}

/// Forward recursion: the metrics after a step from those before it.
template <class Rule>
constexpr StateMetrics<Rule> alphaStep(const StateMetrics<Rule>& a,
                                       const BranchMetrics<typename Rule::Word>& g, const Rule& rule) {
    StateMetrics<Rule> next{};
    for (std::size_t state = 0; state < trellis::states; ++state) {
        const std::size_t plus = trellis::plusSource(state);
        const std::size_t minus = trellis::minusSource(state);
        const auto metric = g[trellis::branchMetric(plus)];
        next[state] = rule.larger(Rule::plus(a[plus], metric), Rule::minus(a[minus], metric));
    }
    return next;
}

/// Backward recursion: the metrics before a step from those after it.
template <class Rule>
constexpr StateMetrics<Rule> betaStep(const StateMetrics<Rule>& b,
                                      const BranchMetrics<typename Rule::Word>& g, const Rule& rule) {
    StateMetrics<Rule> previous{};
    for (std::size_t state = 0; state < trellis::states; ++state) {
        const auto metric = g[trellis::branchMetric(state)];
        previous[state] = rule.larger(Rule::plus(b[trellis::plusTarget[state]], metric),
                                      Rule::minus(b[trellis::minusTarget(state)], metric));
    }
    return previous;
}

/// Log-likelihood ratio of a step from the metrics before (a) and after (b) it: the best + branch less the
/// best
/// - branch. The branches of two states that share a branch metric are compared first and the metric added to
/// the larger one; order and pairing of the maxima are those of the hardware's tree.
template <class Rule>
constexpr typename Rule::Word llrStep(const StateWords<typename Rule::Word>& a,
                                      const StateWords<typename Rule::Word>& b,
                                      const BranchMetrics<typename Rule::Word>& g, const Rule& rule) {
    std::array<typename Rule::Metric, 4> plus{};
    std::array<typename Rule::Metric, 4> minus{};
    for (std::size_t pair = 0; pair < 4; ++pair) {
        const std::size_t even = 2 * pair;
        const std::size_t odd = even + 1;
        const auto path = [&](std::size_t from, std::size_t to) { return Rule::load(add(a[from], b[to])); };
        plus[pair] = Rule::plus(
            rule.larger(path(odd, trellis::plusTarget[odd]), path(even, trellis::plusTarget[even])), g[pair]);
        minus[pair] = Rule::minus(
            rule.larger(path(odd, trellis::minusTarget(odd)), path(even, trellis::minusTarget(even))),
            g[pair]);
    }
    const auto best = [&rule](const std::array<typename Rule::Metric, 4>& m) {
        return Rule::result(rule.larger(rule.larger(m[0], m[1]), rule.larger(m[2], m[3])));
    };
    return sub(best(plus), best(minus));
}

}  // namespace quarzel
