// SPDX-License-Identifier: MIT
#include "coverage/recursion_replay.hpp"

#include <algorithm>

namespace quarzel::tool {

namespace {

/// The code word begins in state 0.
constexpr Metrics known = {0, -1024, -1024, -1024, -1024, -1024, -1024, -1024};
/// The passes of the first iteration have no metrics of other segments and windows yet.
constexpr unsigned firstPassWithStarts = 2;
/// Stored metrics lose these bits.
constexpr int maskedBits = 7;

constexpr Comparison alphaEvents = {Event::alphaTie, Event::alphaOrder, Event::alphaCorrection};
constexpr Comparison betaEvents = {Event::betaTie, Event::betaOrder, Event::betaCorrection};

std::array<Candidate, encoderStates> candidates(const Metrics& metrics) {
    std::array<Candidate, encoderStates> values{};
    std::transform(metrics.begin(), metrics.end(), values.begin(),
                   [](int value) { return Candidate{value}; });
    return values;
}

Metrics valuesOf(const std::array<Candidate, encoderStates>& candidates) {
    Metrics metrics{};
    std::transform(candidates.begin(), candidates.end(), metrics.begin(),
                   [](const Candidate& candidate) { return candidate.value; });
    return metrics;
}

}  // namespace

void RecursionReplay::add(const PassValues& pass) {
    if (pass.number() == 0) {
        start(pass.K());
    }
    addAlpha(pass);
    addBeta(pass);
}

void RecursionReplay::start(std::uint32_t K) {
    itsLayout = layout(K, itsUnits);
    itsWindows.clear();
    std::size_t offset = 0;
    for (std::size_t w = 0; w < itsLayout.windows; ++w) {
        const bool isHighest = w + 1 == itsLayout.windows;
        for (std::size_t segment = 0; segment < itsLayout.segments; ++segment) {
            const std::size_t bottom = segment * itsLayout.segment_steps + offset;
            itsWindows.push_back({bottom, bottom + itsLayout.window_steps[w] - 1, isHighest,
                                  isHighest && segment + 1 == itsLayout.segments});
        }
        offset += itsLayout.window_steps[w];
    }
    for (std::size_t code = 0; code < 2; ++code) {
        itsAlphaStarts[code].assign(itsLayout.segments, {});
        itsAlphaStarts[code].front() = known;
        itsBetaStarts[code].assign(itsWindows.size(), {});
    }
}

RecursionReplay::Candidates RecursionReplay::alphaStep(const Candidates& before, const PassValues& pass,
                                                       std::size_t step) {
    Candidates next;
    for (std::size_t state = 0; state < next.size(); ++state) {
        const std::size_t one = itsTrellis.source[1][state];
        const std::size_t zero = itsTrellis.source[0][state];
        const auto branchOf = [&](std::size_t from) { return pass.branch(step, itsTrellis.column[from]); };
        next[state] =
            itsMaximum.larger(plus(before[one], branchOf(one), Event::alphaWrap, state, itsCounts),
                              plus(before[zero], -branchOf(zero), Event::alphaWrap, state, itsCounts),
                              alphaEvents, state, itsCounts);
    }
    return next;
}

RecursionReplay::Candidates RecursionReplay::betaStep(const Candidates& after, const PassValues& pass,
                                                      std::size_t step) {
    Candidates previous;
    for (std::size_t state = 0; state < previous.size(); ++state) {
        const int branch = pass.branch(step, itsTrellis.column[state]);
        previous[state] = itsMaximum.larger(
            plus(after[itsTrellis.target[1][state]], branch, Event::betaWrap, state, itsCounts),
            plus(after[itsTrellis.target[0][state]], -branch, Event::betaWrap, state, itsCounts), betaEvents,
            state, itsCounts);
    }
    return previous;
}

/// Metrics as they are stored at the end of a segment or window: without low bits and pending corrections.
Metrics RecursionReplay::masked(const Candidates& metrics, Event mask, Event pending) {
    Metrics stored{};
    for (std::size_t state = 0; state < stored.size(); ++state) {
        stored[state] = metrics[state].value & ~maskedBits;
        itsCounts.addIf(stored[state] != metrics[state].value, mask, state);
        itsCounts.addIf(metrics[state].pending != 0, pending, state);
    }
    return stored;
}

void RecursionReplay::addAlpha(const PassValues& pass) {
    std::vector<Metrics>& starts = itsAlphaStarts[pass.code()];
    const std::size_t steps = itsLayout.segment_steps;
    Metrics stored{};  // at the end of the segment before
    for (std::size_t segment = 0; segment < itsLayout.segments; ++segment) {
        const bool isLast = segment + 1 == itsLayout.segments;
        const std::size_t from = segment * steps;
        requireEqual(starts[segment], pass.alpha(from));
        if (segment != 0) {
            itsCounts.addIf(pass.number() >= firstPassWithStarts && starts[segment] != stored,
                            Event::alphaNextPass, isLast ? 1 : 0);
            starts[segment] = stored;
        }
        Candidates metrics = candidates(pass.alpha(from));
        for (std::size_t step = from; step < from + steps; ++step) {
            metrics = alphaStep(metrics, pass, step);
            if (isLast || step + 1 < from + steps) {
                requireEqual(valuesOf(metrics), pass.alpha(step + 1));
            }
        }
        if (!isLast) {
            stored = masked(metrics, Event::alphaMask, Event::alphaPending);
        }
    }
}

void RecursionReplay::addBeta(const PassValues& pass) {
    const std::size_t segments = itsLayout.segments;
    const std::vector<Metrics> before = itsBetaStarts[pass.code()];
    std::vector<Metrics>& starts = itsBetaStarts[pass.code()];
    for (std::size_t i = 0; i < itsWindows.size(); ++i) {
        const Window& window = itsWindows[i];
        Candidates metrics = candidates(pass.beta(window.top));
        for (std::size_t step = window.top; step > window.bottom; --step) {
            metrics = betaStep(metrics, pass, step);
            requireEqual(valuesOf(metrics), pass.beta(step - 1));
        }
        if (window.bottom != 0) {
            // The window just below is of the same segment, or the highest one of the segment before.
            const std::size_t below = i >= segments ? i - segments : itsWindows.size() - segments + i - 1;
            starts[below] =
                masked(betaStep(metrics, pass, window.bottom), Event::betaMask, Event::betaPending);
        }
    }
    // The lowest windows run first. What they store for the segment before is there in the same pass when
    // the highest windows are not read until another group of windows has run.
    const bool isInTime = itsLayout.windows > 2;
    for (std::size_t i = 0; i < itsWindows.size(); ++i) {
        const Window& window = itsWindows[i];
        if (window.startsWithTail) {
            requireEqual(tailMetrics(pass), pass.beta(window.top));
        } else if (pass.number() < firstPassWithStarts) {
            requireEqual(Metrics{}, pass.beta(window.top));
        } else {
            const bool isOfThisPass = isInTime && window.isHighest;
            requireEqual(isOfThisPass ? starts[i] : before[i], pass.beta(window.top));
            if (isOfThisPass) {
                itsCounts.addIf(starts[i] != before[i], Event::betaSamePass, 0);
            } else {
                itsCounts.addIf(starts[i] != before[i], Event::betaNextPass, window.isHighest ? 1 : 0);
            }
        }
    }
}

/// The metrics below the three termination steps: the sum along the only path from each state to state 0.
Metrics RecursionReplay::tailMetrics(const PassValues& pass) {
    Candidates sums;
    for (std::size_t state = 0; state < sums.size(); ++state) {
        std::size_t at = state;
        for (std::size_t step = pass.K(); step < pass.K() + 3; ++step) {
            const std::size_t next = at / 2;
            const int sign = itsTrellis.target[1][at] == next ? 1 : -1;
            const int parity = itsTrellis.column[at] >= 2 ? pass.parity(step) : -pass.parity(step);
            sums[state].value += sign * (pass.systematic(step) + parity);
            at = next;
        }
    }
    return masked(sums, Event::tailMask, Event::betaPending);
}

}  // namespace quarzel::tool
