// SPDX-License-Identifier: MIT
#include "trace/trace_cause.hpp"

#include <gtest/gtest.h>

#include <set>
#include <sstream>

#include "trace/metric_source.hpp"
#include "trace_cases.hpp"

namespace quarzel::test {

namespace {

using tool::StepInputs;
using tool::TraceDifference;

/// Call `visit(trace, block, pass, steps)` for every pass of the stored traces.
template <class Visit>
void forEachPass(const Visit& visit) {
    for (const TraceCase& trace : traceCases()) {
        std::istringstream stream(trace.text);
        tool::TraceBlockReader reader(tool::makeTraceReader(stream, trace.name, std::nullopt));
        while (auto next = reader.next()) {
            const auto block = std::make_shared<const tool::TraceBlock>(std::move(*next));
            for (const auto& [pass, table] : block->tables()) {
                if (pass) {
                    visit(trace, block, *pass, *block->steps());
                }
            }
        }
    }
}

TraceDifference at(const std::shared_ptr<const tool::TraceBlock>& block, std::uint32_t pass,
                   std::uint32_t steps, std::uint32_t step, const char* heading) {
    return {{block, block}, pass, steps, true, step, *tool::columnUnder(heading)};
}

/// The steps whose metrics no recursion gives: forward, the first of each segment, backward, the last of each
/// window.
std::set<std::uint32_t> startsOfRecursions(const TraceCase& trace, std::uint32_t K, bool isForward) {
    const Layout cut = layout(K, static_cast<std::uint32_t>(trace.units));
    std::set<std::uint32_t> starts;
    for (std::uint32_t segment = 0; segment < cut.segments; ++segment) {
        std::uint32_t step = segment * cut.segment_steps;
        if (isForward) {
            starts.insert(step);
            continue;
        }
        for (std::uint32_t window = 0; window < cut.windows; ++window) {
            step += cut.window_steps[window];
            starts.insert(step - 1);
        }
    }
    return starts;
}

}  // namespace

TEST(TraceCause, RecomputesEveryStateMetricButThoseWithWhichRecursionsBegin) {
    std::size_t recomputed = 0;
    forEachPass([&](const TraceCase& trace, const auto& block, std::uint32_t pass, std::uint32_t steps) {
        const std::uint32_t K = steps - tool::terminationSteps;
        for (const bool isForward : {true, false}) {
            const auto starts = startsOfRecursions(trace, K, isForward);
            for (std::uint32_t step = 0; step < K; ++step) {
                if (starts.contains(step)) {
                    continue;
                }
                const TraceDifference place = at(block, pass, steps, step, isForward ? "a0" : "b0");
                StepInputs inputs(place);
                const auto rule = tool::MetricSource(inputs, isForward, step).ruleOfStep();
                ASSERT_TRUE(rule) << trace.name << " pass " << pass << " step " << step;
                ASSERT_TRUE(!rule->rule.hasCorrections() || trace.algorithm == 2) << trace.name;
                ++recomputed;
            }
        }
    });
    EXPECT_GT(recomputed, 5000U);
}

TEST(TraceCause, RecomputesEveryLogLikelihoodRatio) {
    forEachPass([&](const TraceCase& trace, const auto& block, std::uint32_t pass, std::uint32_t steps) {
        const tool::StepRule rule(trace.algorithm == 2);
        for (std::uint32_t step = 0; step + tool::terminationSteps < steps; ++step) {
            const auto values = [&](const char* signal) {
                return [&, signal](unsigned number) {
                    return block->value(pass, step, *tool::findColumn(signal, number)).raw();
                };
            };
            ASSERT_EQ(rule.ratio(values("a"), values("b"), values("g")).llr,
                      block->value(pass, step, *tool::columnUnder("llr")).raw())
                << trace.name << " pass " << pass << " step " << step;
        }
    });
}

TEST(TraceCause, RecomputesEveryIntrinsicBranchAndExtrinsicValue) {
    forEachPass([&](const TraceCase& trace, const auto& block, std::uint32_t pass, std::uint32_t steps) {
        for (std::uint32_t step = 0; step + tool::terminationSteps < steps; ++step) {
            for (const char* heading : {"int", "g4", "g5", "g6", "g7", "ext"}) {
                const TraceDifference place = at(block, pass, steps, step, heading);
                const std::vector<std::string> sentences = tool::causeOf(place);
                ASSERT_EQ(sentences.size(), std::string(heading) == "int" ? 3U : 4U);
                const std::string& result = sentences[sentences.size() - 2];
                ASSERT_TRUE(result.ends_with(' ' + place.value(0).text()))
                    << trace.name << " pass " << pass << " step " << step << ' ' << heading << ": " << result;
            }
        }
    });
}

}  // namespace quarzel::test
