// SPDX-License-Identifier: MIT
#include "trace/metric_cause.hpp"

#include <fmt/format.h>

#include "trace/metric_source.hpp"

namespace quarzel::tool {

namespace {

/// The larger one of the candidates by a rule, when their branch metric is another.
int withOtherBranchMetric(const std::array<StepMetric, 2>& candidates, const MetricRule& rule, int change) {
    StepMetric plus = candidates[1];
    StepMetric minus = candidates[0];
    plus.value = wrapped(plus.value + change);
    minus.value = wrapped(minus.value - change);
    return rule.rule.larger(plus, minus).value;
}

class MetricCause {
  public:
    MetricCause(const TraceDifference& difference, StepInputs& inputs)
        : itsB(difference.value(1)),
          itsInputs(inputs),
          itsState(*traceColumns()[difference.column].number),
          itsSignal(traceColumns()[difference.column].signal),
          itsSource(inputs, !isComputedDownwards(difference.column), difference.step) {}

    void explain(std::vector<std::string>& sentences) {
        const std::optional<MetricRule> rule = itsSource.ruleOfStep();
        for (const unsigned bit : {0U, 1U}) {
            itsCandidates[bit] =
                itsSource.candidate(itsState, bit, rule.value_or(MetricRule{StepRule(false), true}));
        }
        sentences.back() += fmt::format("; its two candidates, of step {}, are", itsSource.step());
        sentences.push_back(textOf(1));
        sentences.push_back(textOf(0));
        if (!rule) {
            sentences.emplace_back("A has neither: a segment or window begins here");
            return;
        }
        const StepMetric chosen = rule->rule.larger(itsCandidates[1], itsCandidates[0]);
        const int pending = itsCandidates[chosen.bit].pending;
        sentences.push_back(pending == 0
                                ? fmt::format("the larger is {}", chosen.value)
                                : fmt::format("the larger, with the correction of {} pending for it, is {}",
                                              pending, chosen.value));
        if (itsB.isNumber()) {
            if (const std::string guess = likelyFault(*rule, chosen.bit); !guess.empty()) {
                sentences.push_back(guess);
            }
        }
    }

  private:
    /// How a candidate comes about.
    std::string textOf(unsigned bit) {
        const unsigned column = itsSource.way(itsState, bit).metric;
        const StepMetric& candidate = itsCandidates[bit];
        const char sign = bit == 1 ? '+' : '-';
        return fmt::format("{}{} {} g{} = {} {} {} = {}", itsSignal, candidate.state, sign, column,
                           itsSource.metric(candidate.state), sign,
                           StepInputs::parenthesised(itsSource.branchMetric(column)), candidate.value);
    }

    /// The fault that gives what B has; empty when none is known.
    std::string likelyFault(const MetricRule& rule, unsigned chosen) const {
        const StepMetric& other = itsCandidates[1 - chosen];
        if (itsB.raw() == wrapped(other.value + other.pending)) {
            return "B has the other one";
        }
        if (itsB.raw() == itsCandidates[chosen].value) {
            return "B lacks the correction";
        }
        const unsigned right = itsSource.way(itsState, 1).metric;
        const int g = itsInputs.peek("g", right, itsSource.step());
        for (unsigned column = 4; column < 8; ++column) {
            const int change = itsInputs.peek("g", column, itsSource.step()) - g;
            if (withOtherBranchMetric(itsCandidates, rule, change) == itsB.raw()) {
                return fmt::format("B has what g{} gives in the place of g{}", column, right);
            }
        }
        return "";
    }

    TraceValue itsB;
    StepInputs& itsInputs;
    unsigned itsState;
    const char* itsSignal;
    MetricSource itsSource;
    std::array<StepMetric, 2> itsCandidates{};  ///< by information bit
};

}  // namespace

void explainMetric(const TraceDifference& difference, StepInputs& inputs,
                   std::vector<std::string>& sentences) {
    const bool isBackward = isComputedDownwards(difference.column);
    if (!isBackward && difference.step == 0) {
        sentences.emplace_back("it is where the recursion begins, in state 0");
    } else if (isBackward && difference.step + terminationSteps + 1 == difference.steps) {
        sentences.emplace_back("it comes from the soft values of the termination steps");
    } else {
        MetricCause(difference, inputs).explain(sentences);
    }
}

}  // namespace quarzel::tool
