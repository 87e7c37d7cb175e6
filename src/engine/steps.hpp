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
        const std::size_t plus = trellis::links.plusSource[state];
        const std::size_t minus = trellis::links.minusSource[state];
        const auto metric = g[trellis::links.branchMetric[plus]];
        next[state] = rule.larger(Rule::plus(a[plus], metric), Rule::minus(a[minus], metric));
    }
    return next;
}

/// The backward metrics at the ends of the two branches of each state, with the branch metric added: the
/// candidates of the backward recursion.
template <class Rule>
struct BackwardCandidates {
    StateMetrics<Rule> plus;
    StateMetrics<Rule> minus;
};

template <class Rule>
constexpr BackwardCandidates<Rule> backwardCandidates(const StateMetrics<Rule>& b,
                                                      const BranchMetrics<typename Rule::Word>& g) {
    BackwardCandidates<Rule> candidates{};
    for (std::size_t state = 0; state < trellis::states; ++state) {
        const auto metric = g[trellis::links.branchMetric[state]];
        candidates.plus[state] = Rule::plus(b[trellis::links.plusTarget[state]], metric);
        candidates.minus[state] = Rule::minus(b[trellis::links.minusTarget[state]], metric);
    }
    return candidates;
}

/// Backward recursion: the metrics before a step.
template <class Rule>
constexpr StateMetrics<Rule> betaStep(const BackwardCandidates<Rule>& candidates, const Rule& rule) {
    StateMetrics<Rule> previous{};
    for (std::size_t state = 0; state < trellis::states; ++state) {
        previous[state] = rule.larger(candidates.plus[state], candidates.minus[state]);
    }
    return previous;
}

/// The upper levels of the hardware's tree of maxima, over the four pairs of branches of one sign.
template <class Rule>
constexpr typename Rule::Word bestOfPairs(const std::array<typename Rule::Metric, 4>& pairs,
                                          const Rule& rule) {
    return Rule::result(rule.larger(rule.larger(pairs[0], pairs[1]), rule.larger(pairs[2], pairs[3])));
}

/// Log-likelihood ratio of a step from the metrics before (a) and after (b) it: the best + branch less the
/// best
/// - branch. The branches of two states that share a branch metric are compared first, the odd state's being
/// the first candidate, and the metric is added to the larger one; order and pairing of the maxima are those
/// of the hardware's tree.
template <class Rule>
constexpr typename Rule::Word llrStep(const StateWords<typename Rule::Word>& a,
                                      const StateWords<typename Rule::Word>& b,
                                      const BranchMetrics<typename Rule::Word>& g, const Rule& rule) {
    std::array<typename Rule::Metric, 4> plus{};
    std::array<typename Rule::Metric, 4> minus{};
    for (std::size_t pair = 0; pair < 4; ++pair) {
        const std::size_t even = 2 * pair;
        const std::size_t odd = even + 1;
        const auto path = [&](std::size_t from, const std::size_t* target) {
            return Rule::load(add(a[from], b[target[from]]));
        };
        const auto larger = [&](const std::size_t* target) {
            return rule.larger(path(odd, target), path(even, target));
        };
        plus[pair] = Rule::plus(larger(trellis::links.plusTarget), g[pair]);
        minus[pair] = Rule::minus(larger(trellis::links.minusTarget), g[pair]);
    }
    return sub(bestOfPairs(plus, rule), bestOfPairs(minus, rule));
}

/// The same ratio from the candidates that the backward recursion has formed already. Adding the branch
/// metric before the first maximum rather than after it changes neither a wrapped difference nor a wrapped
/// sum.
template <class Rule, class BackwardRule>
constexpr typename Rule::Word llrStep(const StateWords<typename Rule::Word>& a,
                                      const BackwardCandidates<BackwardRule>& candidates, const Rule& rule) {
    std::array<typename Rule::Metric, 4> plus{};
    std::array<typename Rule::Metric, 4> minus{};
    for (std::size_t pair = 0; pair < 4; ++pair) {
        const std::size_t even = 2 * pair;
        const std::size_t odd = even + 1;
        const auto larger = [&](const StateMetrics<BackwardRule>& ends) {
            return rule.larger(Rule::load(add(a[odd], BackwardRule::store(ends[odd]))),
                               Rule::load(add(a[even], BackwardRule::store(ends[even]))));
        };
        plus[pair] = larger(candidates.plus);
        minus[pair] = larger(candidates.minus);
    }
    return sub(bestOfPairs(plus, rule), bestOfPairs(minus, rule));
}

}  // namespace quarzel
