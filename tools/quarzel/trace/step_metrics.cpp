// SPDX-License-Identifier: MIT
#include "trace/step_metrics.hpp"

namespace quarzel::tool {

StepMetric StepRule::larger(const StepMetric& x, const StepMetric& y) const {
    static const auto table = corrections();
    const int difference = wrapped(x.value - y.value);
    StepMetric chosen = difference < 0 ? y : x;
    chosen.value = wrapped(chosen.value + chosen.pending);
    chosen.pending = itsHasCorrections ? table[static_cast<std::size_t>(difference + 2048)] : 0;
    return chosen;
}

StepRule::Ratio StepRule::ratio(const std::function<int(unsigned)>& a, const std::function<int(unsigned)>& b,
                                const std::function<int(unsigned)>& g) const {
    Ratio ratio{};
    for (const unsigned bit : {0U, 1U}) {
        std::array<StepMetric, encoderStates / 2> pairs{};
        for (unsigned pair = 0; pair < pairs.size(); ++pair) {
            const auto path = [&](unsigned state) {
                return StepMetric{wrapped(a(state) + b(branch(state, bit).to)), 0, state, bit};
            };
            // The states of a pair share a branch metric; the odd one's path is the first candidate.
            pairs[pair] = larger(path(2 * pair + 1), path(2 * pair));
            const int metric = g(branch(2 * pair, bit).metric);
            pairs[pair].value = wrapped(pairs[pair].value + (bit == 1 ? metric : -metric));
        }
        StepMetric& best = ratio.best[bit];
        best = larger(larger(pairs[0], pairs[1]), larger(pairs[2], pairs[3]));
        best.value = wrapped(best.value + best.pending);
        best.pending = 0;
    }
    ratio.llr = wrapped(ratio.best[1].value - ratio.best[0].value);
    return ratio;
}

Branch branchInto(unsigned state, unsigned bit) {
    unsigned from = 0;
    while (branch(from, bit).to != state) {
        ++from;
    }
    return branch(from, bit);
}

}  // namespace quarzel::tool
