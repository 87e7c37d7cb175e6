// SPDX-License-Identifier: MIT
#pragma once

#include <optional>

#include "trace/step_inputs.hpp"
#include "trace/step_metrics.hpp"

namespace quarzel::tool {

/// How the maxima of a recursion were taken at a step.
struct MetricRule {
    StepRule rule;
    bool isFresh;  ///< whether no correction was pending, as where a recursion begins
};

/// Where the metrics of a step come from: those of the step before it in the recursion.
class MetricSource {
  public:
    /// @param isForward  forward metrics, else backward metrics
    /// @param step       whose metrics are recomputed
    MetricSource(StepInputs& inputs, bool isForward, std::uint32_t step)
        : itsInputs(inputs), itsIsForward(isForward), itsStep(step) {}

    /// The rule by which A has all metrics of the step; none when it has them from elsewhere.
    /// @throws MissingInput when A does not tell what they come from
    std::optional<MetricRule> ruleOfStep() const;

    /// The path of a bit that may give the metric of a state, with its pending correction.
    StepMetric candidate(unsigned state, unsigned bit, const MetricRule& rule) const;

    /// The branch of that path.
    Branch way(unsigned state, unsigned bit) const {
        return itsIsForward ? branchInto(state, bit) : branch(state, bit);
    }

    /// The step that the metrics come from.
    std::uint32_t step() const { return before(itsStep); }

    int metric(unsigned state) const { return itsInputs.value(signal(), state, step()); }
    int branchMetric(unsigned column) const { return itsInputs.value("g", column, step()); }

  private:
    std::uint32_t before(std::uint32_t step) const { return itsIsForward ? step - 1 : step + 1; }
    const char* signal() const { return itsIsForward ? "a" : "b"; }
    unsigned sourceOf(unsigned state, unsigned bit) const {
        return itsIsForward ? way(state, bit).from : way(state, bit).to;
    }
    int sumAt(std::uint32_t step, unsigned state, unsigned bit) const;

    StepInputs& itsInputs;
    bool itsIsForward;
    std::uint32_t itsStep;
};

}  // namespace quarzel::tool
