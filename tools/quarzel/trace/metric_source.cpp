// SPDX-License-Identifier: MIT
#include "trace/metric_source.hpp"

namespace quarzel::tool {

/// The metric that a path comes from and the branch metric of its bit, added up at a step.
int MetricSource::sumAt(std::uint32_t step, unsigned state, unsigned bit) const {
    const int metric = itsInputs.peek(signal(), sourceOf(state, bit), before(step));
    const int branchMetric = itsInputs.peek("g", way(state, bit).metric, before(step));
    return wrapped(bit == 1 ? metric + branchMetric : metric - branchMetric);
}

StepMetric MetricSource::candidate(unsigned state, unsigned bit, const MetricRule& rule) const {
    const unsigned source = sourceOf(state, bit);
    StepMetric path{sumAt(itsStep, state, bit), 0, source, bit};
    if (rule.rule.hasCorrections() && !rule.isFresh) {
        const std::uint32_t previous = before(itsStep);
        path.pending =
            rule.rule.larger({sumAt(previous, source, 1), 0, 0, 1}, {sumAt(previous, source, 0), 0, 0, 0})
                .pending;
    }
    return path;
}

std::optional<MetricRule> MetricSource::ruleOfStep() const {
    const auto fits = [this](const MetricRule& rule) {
        for (unsigned state = 0; state < encoderStates; ++state) {
            const int value = rule.rule.larger(candidate(state, 1, rule), candidate(state, 0, rule)).value;
            if (value != itsInputs.peek(signal(), state, itsStep)) {
                return false;
            }
        }
        return true;
    };
    for (const MetricRule& rule : {MetricRule{StepRule(false), true}, MetricRule{StepRule(true), false},
                                   MetricRule{StepRule(true), true}}) {
        try {
            if (fits(rule)) {
                return rule;
            }
        } catch (const MissingInput&) {
            // The trace, or the block, begins a step before: no correction can be pending.
            continue;
        }
    }
    return std::nullopt;
}

}  // namespace quarzel::tool
