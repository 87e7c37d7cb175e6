// SPDX-License-Identifier: MIT
#include "trace/trace_cause.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <cstdlib>

#include "trace/metric_cause.hpp"
#include "trace/step_inputs.hpp"
#include "trace/step_metrics.hpp"

namespace quarzel::tool {

namespace {

/// Recomputes the value of a difference. Values are in units of 1/8.
class Cause {
  public:
    explicit Cause(const TraceDifference& difference)
        : itsDifference(difference),
          itsInputs(difference),
          itsColumn(traceColumns()[difference.column]),
          itsA(difference.value(0)),
          itsB(difference.value(1)) {}

    std::vector<std::string> sentences() {
        const std::string_view signal = itsColumn.signal;
        if (isInput(itsDifference.column) || itsDifference.isTermination() || !itsA.isNumber()) {
            return {};
        }
        itsSentences.push_back(fmt::format("{} of step {} is {}", itsColumn.heading(), itsDifference.step,
                                           deviation(signal == "a" || signal == "b")));
        try {
            if (signal == "a" || signal == "b") {
                explainMetric(itsDifference, itsInputs, itsSentences);
            } else if (signal == "g") {
                explainBranchMetric();
            } else if (signal == "int") {
                explainIntrinsic();
            } else if (signal == "llr") {
                explainRatio();
            } else if (signal == "ext") {
                explainExtrinsic();
            }
            tellOfInputs();
        } catch (const MissingInput& missing) {
            itsSentences.push_back(fmt::format("it cannot be recomputed: A does not tell {}", missing.name));
        }
        return itsSentences;
    }

  private:
    std::string deviation(bool wraps) const {
        if (!itsB.isNumber()) {
            return fmt::format("{} instead of {}", itsB.text(), itsA.raw());
        }
        const int low = itsA.raw() - itsB.raw();
        const int least = wraps ? wrapped(low) : low;
        return fmt::format("{} {}", std::abs(least), least > 0 ? "low" : "high");
    }

    void explainIntrinsic() {
        const auto x = itsInputs.twiceIntrinsic();
        itsSentences.push_back(fmt::format("{}; half of it is {}", x.text, x.value >> 1));
    }

    void explainBranchMetric() {
        const auto x = itsInputs.twiceIntrinsic();
        const unsigned column = *itsColumn.number;
        const int p = itsInputs.soft("par0");
        const int q = itsInputs.soft("par1");
        const bool addsP = column >= 6;
        const bool addsQ = column % 2 == 1;
        const int sum = x.value + (addsP ? p : -p) + (addsQ ? q : -q);
        itsSentences.push_back(fmt::format("x, twice the intrinsic value, is {}", x.text));
        itsSentences.push_back(fmt::format("x {} p {} q = {} {} {} {} {} = {}, clamped to -128 to 127: {}",
                                           addsP ? '+' : '-', addsQ ? '+' : '-', x.value, addsP ? '+' : '-',
                                           itsInputs.parenthesised(p), addsQ ? '+' : '-',
                                           itsInputs.parenthesised(q), sum, std::clamp(sum, -128, 127)));
        if (itsB.isNumber() && itsB.raw() == sum && itsB != itsA) {
            itsSentences.push_back("B has the sum without the clamp");
        }
    }

    void explainRatio() {
        const auto values = [this](const char* signal) {
            return [this, signal](unsigned number) {
                return itsInputs.value(signal, number, itsDifference.step);
            };
        };
        for (const bool hasCorrections : {false, true}) {
            const StepRule::Ratio ratio =
                StepRule(hasCorrections).ratio(values("a"), values("b"), values("g"));
            if (ratio.llr != itsA.raw() && !hasCorrections) {
                continue;
            }
            for (const unsigned bit : {1U, 0U}) {
                const StepMetric& best = ratio.best[bit];
                const Branch way = branch(best.state, bit);
                itsSentences.push_back(fmt::format("the best path of bit {} is a{} {} g{} + b{}{}: {}", bit,
                                                   best.state, bit == 1 ? '+' : '-', way.metric, way.to,
                                                   hasCorrections ? " with its corrections" : "",
                                                   best.value));
            }
            itsSentences.push_back(fmt::format("their difference is {}", ratio.llr));
            return;
        }
    }

    void explainExtrinsic() {
        const auto x = itsInputs.twiceIntrinsic();
        const int difference = itsInputs.value("llr", std::nullopt, itsDifference.step) - 2 * x.value;
        itsSentences.push_back(fmt::format("x, twice the intrinsic value, is {}", x.text));
        const int plain = std::clamp(difference, -128, 127);
        const int scaled = std::clamp((3 * difference) >> 2, -128, 127);
        const bool isScaled = plain != itsA.raw();
        itsSentences.push_back(fmt::format("llr - 2 x is {}{}, clamped to -128 to 127: {}", difference,
                                           isScaled ? ", scaled by 0.75" : "", isScaled ? scaled : plain));
        if (itsB.isNumber() && isScaled && itsB.raw() == plain) {
            itsSentences.push_back("B has it without the scaling");
        }
    }

    void tellOfInputs() {
        const std::string lacking = itsInputs.notToldByB();
        const std::string other = itsInputs.otherInB();
        if (!lacking.empty()) {
            itsSentences.push_back(
                fmt::format("B does not tell {}: what is wrong may come from there", lacking));
        }
        if (!other.empty()) {
            itsSentences.push_back(fmt::format("B has other values of {}", other));
        }
        if (lacking.empty() && other.empty() && itsInputs.any()) {
            itsSentences.push_back("B has the same inputs: the fault is in this step");
        }
    }

    const TraceDifference& itsDifference;
    StepInputs itsInputs;
    const TraceColumn& itsColumn;
    TraceValue itsA;
    TraceValue itsB;
    std::vector<std::string> itsSentences;
};

}  // namespace

std::vector<std::string> causeOf(const TraceDifference& difference) {
    return difference.isValue ? Cause(difference).sentences() : std::vector<std::string>();
}

}  // namespace quarzel::tool
