// SPDX-License-Identifier: MIT
#include "plot/plot_script.hpp"

#include <gtest/gtest.h>

#include "golden.hpp"

namespace quarzel::test {

namespace {

tool::SweepCurve curve(int algorithm, const std::vector<tool::MeasuredPoint>& points) {
    return {"a.json", 40, 2, algorithm, 2, "LLR \u00d7 8", 7, points};
}

const tool::MeasuredPoint bad = {0.5, {0.1, 0.08, 0.13}, {0.5, 0.4, 0.6}, {0.2, 0.1}, {0.7, 0.5}};
const tool::MeasuredPoint good = {1, {1e-3, 0, 2e-3}, {0.01, 0.002, 0.03}, {0.01, 1e-3}, {0.2, 0.01}};
const tool::MeasuredPoint best = {1.5, {0, 0, 1e-4}, {0, 0, 3e-3}, {1e-3, 0}, {0.1, 0}};

}  // namespace

TEST(PlotScript, DrawsRatesWithIntervalsBoundsAndReferences) {
    const tool::Picture picture =
        tool::ratesPicture({curve(0, {bad, good, best}), curve(1, {good})},
                           {{"it's `a` \"reference\"\n", {{0.5, 0.2}, {1, 0.1}}, {}}});
    expectGolden(tool::plotScript(picture, "svg"), "plot_rates.txt");
}

TEST(PlotScript, DrawsALineForEachIteration) {
    const tool::Picture picture = tool::iterationsPicture(curve(2, {bad, good, best}), {});
    expectGolden(tool::plotScript(picture, "pdf"), "plot_iterations.txt");
}

}  // namespace quarzel::test
