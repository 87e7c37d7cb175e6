// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>

#include "engine/trellis.hpp"
#include "fixed/unrolled.hpp"
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
    // The two states that a pair of sources leads to are taken together, so that few values are alive at a
    // time.
    unrolled<trellis::states>([&](auto i) {
        constexpr std::size_t state = i / 2 + 4 * (i % 2);
        constexpr std::size_t plus = trellis::links.plusSource[state];
        constexpr std::size_t minus = trellis::links.minusSource[state];
        const auto metric = g[trellis::links.branchMetric[plus]];
        next[state] = rule.larger(Rule::plus(a[plus], metric), Rule::minus(a[minus], metric));
    });
    return next;
}

/// Backward recursion: the metrics before a step from those after it.
template <class Rule>
constexpr StateMetrics<Rule> betaStep(const StateMetrics<Rule>& b,
                                      const BranchMetrics<typename Rule::Word>& g, const Rule& rule) {
    StateMetrics<Rule> previous{};
    unrolled<trellis::states>([&](auto state) {
        const auto metric = g[trellis::links.branchMetric[state]];
        previous[state] = rule.larger(Rule::plus(b[trellis::links.plusTarget[state]], metric),
                                      Rule::minus(b[trellis::links.minusTarget[state]], metric));
    });
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
    unrolled<4>([&](auto pair) {
        constexpr std::size_t even = 2 * pair;
        constexpr std::size_t odd = even + 1;
        const auto path = [&](std::size_t from, const std::size_t* target) {
            return Rule::load(add(a[from], b[target[from]]));
        };
        const auto larger = [&](const std::size_t* target) {
            return rule.larger(path(odd, target), path(even, target));
        };
        plus[pair] = Rule::plus(larger(trellis::links.plusTarget), g[pair]);
        minus[pair] = Rule::minus(larger(trellis::links.minusTarget), g[pair]);
    });
    return sub(bestOfPairs(plus, rule), bestOfPairs(minus, rule));
}

template <class Rule>
struct BackwardResult {
    StateMetrics<Rule> beta;
    typename Rule::Word llr;
};

/// Backward recursion and log-likelihood ratio of a step in one: the candidates of the recursion are the ends
/// of the paths that the ratio compares. Adding the branch metric before the first maximum rather than after
/// it changes neither a wrapped difference nor a wrapped sum. State pairs are taken one after the other, so
/// that few values are alive at a time.
///
/// @param alpha    gives the word of a state before the step
/// @param llrRule  the rule of the maxima in the ratio
template <class Rule, class LlrRule, class Alpha>
constexpr BackwardResult<Rule> backwardStep(const StateMetrics<Rule>& b,
                                            const BranchMetrics<typename Rule::Word>& g, const Alpha& alpha,
                                            const Rule& rule, const LlrRule& llrRule) {
    BackwardResult<Rule> result{};
    std::array<typename LlrRule::Metric, 4> plusPairs{};
    std::array<typename LlrRule::Metric, 4> minusPairs{};
    unrolled<4>([&](auto pair) {
        constexpr std::size_t even = 2 * pair;
        constexpr std::size_t odd = even + 1;
        const auto& evenEnd = b[trellis::links.plusTarget[even]];  // and the end of the odd state's - branch
        const auto& oddEnd = b[trellis::links.plusTarget[odd]];
        const auto evenPlus = Rule::plus(evenEnd, g[pair]);
        const auto evenMinus = Rule::minus(oddEnd, g[pair]);
        const auto oddPlus = Rule::plus(oddEnd, g[pair]);
        const auto oddMinus = Rule::minus(evenEnd, g[pair]);
        result.beta[even] = rule.larger(evenPlus, evenMinus);
        result.beta[odd] = rule.larger(oddPlus, oddMinus);
        const auto evenAlpha = alpha(even);
        const auto oddAlpha = alpha(odd);
        plusPairs[pair] = llrRule.larger(LlrRule::load(add(oddAlpha, Rule::store(oddPlus))),
                                         LlrRule::load(add(evenAlpha, Rule::store(evenPlus))));
        minusPairs[pair] = llrRule.larger(LlrRule::load(add(oddAlpha, Rule::store(oddMinus))),
                                          LlrRule::load(add(evenAlpha, Rule::store(evenMinus))));
    });
    result.llr = sub(bestOfPairs(plusPairs, llrRule), bestOfPairs(minusPairs, llrRule));
    return result;
}

}  // namespace quarzel
