// SPDX-License-Identifier: MIT
#include "oracle/plain_decoder.hpp"

namespace quarzel::oracle {
namespace {

/// One step of a recursion: the metrics of the neighbouring step from those of this one.
void step(const Recursion& recursion, const std::array<int, 4>& gamma, const Metrics& from, Metrics& to,
          std::array<int, 8>& pending) {
    std::array<int, 8> newPending{};
    for (std::size_t state = 0; state < 8; ++state) {
        const auto& branches = recursion.branches[state];
        const auto candidate = [&](const Branch& branch) {
            const auto other = static_cast<std::size_t>(branch.state);
            const int metric = branch.sign * gamma[static_cast<std::size_t>(branch.metric)];
            return Candidate{held(recursion.metric, from[other] + metric), pending[other]};
        };
        const Candidate best = maximum(recursion.comparison, recursion.correction, recursion.metric,
                                       candidate(branches[0]), candidate(branches[1]));
        const int stuck = (best.value | recursion.stuckAt1[state]) & ~recursion.stuckAt0[state];
        to[state] = held(Register{recursion.metric.bits, false}, stuck);
        newPending[state] = best.pending;
    }
    pending = newPending;
}

std::size_t placeOf(int index, int count, Place alone) {
    if (count == 1) {
        return alone;
    }
    return index == 0 ? atFirst : index == count - 1 ? atLast : inMiddle;
}

}  // namespace

Metrics PlainDecoder::known() const {
    Metrics metrics;
    metrics.fill(itsDesign.unlikelyMetric);
    metrics[static_cast<std::size_t>(itsDesign.knownState)] = itsDesign.knownMetric;
    return metrics;
}

/// What is kept of metrics for the next iteration.
Metrics PlainDecoder::stored(const Recursion& recursion, const Metrics& metrics, Start start) const {
    if (start == Start::notTruncated) {
        return metrics;
    }
    Metrics kept;
    for (std::size_t state = 0; state < 8; ++state) {
        const int bits = recursion.truncatedBits;
        kept[state] =
            held(recursion.metric, shiftRight(metrics[state], bits, recursion.truncation) * (1 << bits));
    }
    return kept;
}

std::vector<Metrics>& PlainDecoder::startsOf(const Recursion& recursion,
                                             std::array<std::vector<Metrics>, 2>& starts, int code) {
    return starts[recursion.sharesCodes ? 0 : static_cast<std::size_t>(code)];
}

Metrics PlainDecoder::alphaStart(const std::vector<Metrics>& starts, int code, int segment) const {
    const auto i = static_cast<std::size_t>(segment);
    switch (itsDesign.alpha.start[placeOf(segment, itsSegments, atFirst)]) {
        case Start::zero:
            return {};
        case Start::known:
            return known();
        case Start::neighbour:
            return starts[(i + 1) % starts.size()];
        case Start::otherCode:
            return itsAlphaStarts[code == 0 ? 1 : 0][i];
        default:
            return starts[i];
    }
}

void PlainDecoder::runAlphaSegment(int from, int to) {
    if (!itsDesign.alpha.keepsPending) {
        itsAlphaPending = {};
    }
    for (int k = from; k < to; ++k) {
        const auto i = static_cast<std::size_t>(k);
        const int read = std::clamp(k + itsDesign.alpha.metricStep, 0, itsK - 1);
        step(itsDesign.alpha, itsSignals.gamma[static_cast<std::size_t>(read)], itsSignals.alpha[i],
             itsSignals.alpha[i + 1], itsAlphaPending);
    }
}

/// Each segment starts with what the segment before it ended with in the last pass of the same code.
void PlainDecoder::runAlpha(int pass, int code) {
    const Recursion& recursion = itsDesign.alpha;
    auto& starts = startsOf(recursion, itsAlphaStarts, code);
    if (pass < recursion.unknownPasses) {
        starts.assign(starts.size(), {});
        starts[0] = known();
    }
    Metrics ended = starts[0];
    for (int segment = 0; segment < itsSegments; ++segment) {
        const int from = segment * itsSegmentSteps, to = from + itsSegmentSteps;
        const Start kind = recursion.start[placeOf(segment, itsSegments, atFirst)];
        itsSignals.alpha[static_cast<std::size_t>(from)] = alphaStart(starts, code, segment);
        if (kind != Start::frozen) {
            starts[static_cast<std::size_t>(segment)] = stored(recursion, ended, kind);
        }
        runAlphaSegment(from, to);
        ended = itsSignals.alpha[static_cast<std::size_t>(to - recursion.storedStep)];
    }
}

/// The metrics before the termination: its steps have one path from each state.
Metrics PlainDecoder::terminated(int code) const {
    const Termination& termination = itsDesign.termination;
    if (termination.start == Start::zero) {
        return {};
    }
    if (termination.start == Start::known) {
        return known();
    }
    const auto c = static_cast<std::size_t>(code);
    const auto K = static_cast<std::size_t>(itsK);
    Metrics metrics{};
    for (std::size_t state = 0; state < 8; ++state) {
        for (std::size_t r = 0; r < 3; ++r) {
            const auto& sign = termination.sign[state][r];
            metrics[state] += sign[0] * itsSystematic[c][K + r] + sign[1] * itsParity[c][K + r];
        }
        const int bits = termination.truncatedBits;
        metrics[state] = held(termination.metric, (metrics[state] >> bits) * (1 << bits));
    }
    return metrics;
}

Metrics PlainDecoder::betaStart(int pass, int code, int window, const Metrics& fetched) const {
    const auto last = static_cast<int>(itsWindows.size()) - 1;
    const auto& starts = itsBetaStarts[static_cast<std::size_t>(code)];
    switch (itsDesign.beta.start[placeOf(window, last + 1, atLast)]) {
        case Start::zero:
            return {};
        case Start::known:
            return known();
        case Start::neighbour:
            return starts[static_cast<std::size_t>(window == last ? 0 : window + 1)];
        case Start::otherCode:
            return itsBetaStarts[code == 0 ? 1 : 0][static_cast<std::size_t>(window)];
        default:
            return pass < itsDesign.beta.unknownPasses && window != last ? Metrics{} : fetched;
    }
}

void PlainDecoder::runBetaWindow(int from, int to) {
    if (!itsDesign.beta.keepsPending) {
        itsBetaPending = {};
    }
    for (int k = from; k > to; --k) {
        const auto i = static_cast<std::size_t>(k);
        const int read = std::clamp(k + itsDesign.beta.metricStep, 0, itsK - 1);
        step(itsDesign.beta, itsSignals.gamma[static_cast<std::size_t>(read)], itsSignals.beta[i],
             itsSignals.beta[i - 1], itsBetaPending);
    }
}

/// Keep the metrics below a window for the window below it: in the same segment, or the last one of the
/// segment before.
void PlainDecoder::storeBeta(int code, int group, int segment, const Metrics& metrics) {
    const WindowStore& store = itsDesign.windowStore;
    auto& starts = startsOf(itsDesign.beta, itsBetaStarts, code);
    const int windows = static_cast<int>(starts.size());
    const bool within = group > 0;
    const int below = within ? (group - 1) * itsSegments + segment + store.windowShift
                             : windows - itsSegments + segment - 1 + store.segmentShift;
    if (!(within ? store.windows : store.segments) || below < 0 || below >= windows) {
        return;
    }
    const Start kind = itsDesign.beta.start[placeOf(below, windows, atLast)];
    if (kind != Start::frozen) {
        starts[static_cast<std::size_t>(below)] = stored(itsDesign.beta, metrics, kind);
    }
}

void PlainDecoder::runBeta(int pass, int code) {
    const Recursion& recursion = itsDesign.beta;
    const WindowStore& store = itsDesign.windowStore;
    auto& starts = startsOf(recursion, itsBetaStarts, code);
    if (pass < recursion.unknownPasses) {
        starts.assign(starts.size(), {});
        starts.back() = terminated(code);
    }
    itsFetched.assign(starts.begin(), starts.begin() + itsSegments);
    const auto segments = static_cast<std::size_t>(itsSegments);
    for (std::size_t window = 0; window < itsWindows.size(); ++window) {
        const std::size_t segment = window % segments;
        const int from = itsWindows[window].from, to = itsWindows[window].to;
        Metrics& fetched = itsFetched[segment];
        Metrics& below = itsSignals.beta[static_cast<std::size_t>(to)];
        const Metrics saved = below;
        itsSignals.beta[static_cast<std::size_t>(from)] =
            betaStart(pass, code, static_cast<int>(window), store.readsLate ? starts[window] : fetched);
        if (window + segments < starts.size()) {
            fetched = starts[window + segments];
        }
        runBetaWindow(from, to);
        if (window > 0) {
            storeBeta(code, static_cast<int>(window / segments), static_cast<int>(segment),
                      itsSignals.beta[static_cast<std::size_t>(to + recursion.storedStep)]);
            if (!store.spills) {
                below = saved;
            }
        }
    }
}

}  // namespace quarzel::oracle
