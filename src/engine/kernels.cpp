// SPDX-License-Identifier: MIT
// The kernels: loops over T8 records around the steps.
#include "engine/engine_mod_base.hpp"
#include "engine/max_rules.hpp"
#include "engine/steps.hpp"

namespace {

using quarzel::BranchMetrics;
using quarzel::StateMetrics;
using quarzel::StateWords;
using Word = std::int16_t;

/// The correction of a difference, read from a table addressed by its centre entry.
struct TableCorrection {
    const unsigned char* centre;
    Word operator()(Word difference) const { return centre[difference]; }
};

using MaxLog = quarzel::MaxLog<Word>;
using MaxStar = quarzel::MaxStar<Word, TableCorrection>;
using DeferredMaxStar = quarzel::DeferredMaxStar<Word, TableCorrection>;

BranchMetrics<Word> branchMetrics(const T8& g) {
    return {g[0], g[1], g[2], g[3]};
}

StateWords<Word> stateWords(const T8& m) {
    return {m[0], m[1], m[2], m[3], m[4], m[5], m[6], m[7]};
}

template <class Rule>
StateMetrics<Rule> load(const T8& words) {
    StateMetrics<Rule> metrics{};
    for (std::size_t state = 0; state < metrics.size(); ++state) {
        metrics[state] = Rule::load(words[state]);
    }
    return metrics;
}

template <class Rule>
void store(const StateMetrics<Rule>& metrics, T8& words) {
    for (std::size_t state = 0; state < metrics.size(); ++state) {
        words[state] = Rule::store(metrics[state]);
    }
}

template <class Rule>
T8* alphaLoop(unsigned n, const T8* gamma, T8* alpha, const Rule& rule) {
    StateMetrics<Rule> metrics = load<Rule>(*alpha++);
    for (unsigned step = 1; step < n; ++step) {
        metrics = quarzel::alphaStep(metrics, branchMetrics(*gamma++), rule);
        store<Rule>(metrics, *alpha++);
    }
    return alpha;
}

template <class Rule>
T8* betaLoop(unsigned n, const T8* gamma, T8* beta, const Rule& rule) {
    StateMetrics<Rule> metrics = load<Rule>(*beta--);
    for (unsigned step = 1; step < n; ++step) {
        metrics = quarzel::betaStep(metrics, branchMetrics(*gamma--), rule);
        store<Rule>(metrics, *beta--);
    }
    return beta;
}

template <class Rule>
short* llrLoop(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out, const Rule& rule) {
    for (unsigned step = 0; step < n; ++step) {
        *out++ = quarzel::llrStep(stateWords(*alpha++), stateWords(*beta++), branchMetrics(*gamma++), rule);
    }
    return out;
}

}  // namespace

T8* TCalculationEngineModBase::mod_gamma(unsigned n, const short* intrinsic, const short* parity0,
                                         const short* parity1, T8* out) const {
    const Word hi = itsStateFormat->toWord(itsGammaFormat->maxQ);
    const Word lo = itsStateFormat->toWord(itsGammaFormat->minQ);
    for (unsigned step = 0; step < n; ++step, ++out) {
        const auto g = quarzel::gammaStep(intrinsic[step], parity0[step], parity1[step], lo, hi);
        std::copy(g.begin(), g.end(), out->element);
    }
    return out;
}

T8* TCalculationEngineModBase::mod_alpha(unsigned n, const T8* gamma, T8* alpha) const {
    return alphaLoop(n, gamma, alpha, MaxLog{});
}

T8* TCalculationEngineModBase::mod_beta(unsigned n, const T8* gamma, T8* beta) const {
    return betaLoop(n, gamma, beta, MaxLog{});
}

short* TCalculationEngineModBase::mod_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma,
                                          short* out) const {
    return llrLoop(n, alpha, beta, gamma, out, MaxLog{});
}

T8* TCalculationEngineModBase::modstar_alpha(unsigned n, const T8* gamma, T8* alpha) const {
    return alphaLoop(n, gamma, alpha, MaxStar({itsAlphaLUT}));
}

T8* TCalculationEngineModBase::modstar_beta(unsigned n, const T8* gamma, T8* beta) const {
    return betaLoop(n, gamma, beta, MaxStar({itsBetaLUT}));
}

short* TCalculationEngineModBase::modstar_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma,
                                              short* out) const {
    return llrLoop(n, alpha, beta, gamma, out, MaxStar({itsLLRLUT}));
}

T8* TCalculationEngineModBase::modhash_alpha(unsigned n, const T8* gamma, T8* alpha) const {
    return alphaLoop(n, gamma, alpha, DeferredMaxStar({itsAlphaLUT}));
}

T8* TCalculationEngineModBase::modhash_beta(unsigned n, const T8* gamma, T8* beta) const {
    return betaLoop(n, gamma, beta, DeferredMaxStar({itsBetaLUT}));
}

short* TCalculationEngineModBase::modhash_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma,
                                              short* out) const {
    return llrLoop(n, alpha, beta, gamma, out, DeferredMaxStar({itsLLRLUT}));
}
