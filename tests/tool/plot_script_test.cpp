// SPDX-License-Identifier: MIT
#include "plot/plot_script.hpp"

#include <gtest/gtest.h>

#include "golden.hpp"

namespace quarzel::test {

namespace {

tool::MeasuredPoint point(double ebN0, sweep::ErrorCount first, sweep::ErrorCount last) {
    tool::MeasuredPoint point{ebN0, sweep::PointState(0)};
    point.state.blocks = 1000;
    point.state.counts = {first, last};
    point.state.bitErrorSquares = 7 * last.bitErrors;
    return point;
}

tool::SweepCurve curve(int algorithm, const std::vector<tool::MeasuredPoint>& points) {
    return {"a.json", false, 40, 2, algorithm, 2, {link::Quantiser::Kind::llr, 8}, "", 7, 1.0 / 3, points};
}

const tool::MeasuredPoint bad = point(0.5, {900, 200}, {600, 100});
const tool::MeasuredPoint good = point(1, {90, 20}, {10, 4});
const tool::MeasuredPoint best = point(1.5, {9, 3}, {0, 0});

tool::PictureChoice bothPanels() {
    tool::PictureChoice choice;
    choice.panels = {"ber", "bler"};
    return choice;
}

}  // namespace

TEST(PlotScript, DrawsRatesWithIntervalsBoundsAndReferences) {
    const tool::Picture picture =
        tool::pictureOf(bothPanels(), {curve(0, {bad, good, best}), curve(1, {good})},
                        {{"it's `a` \"reference\"\n", {}, {}, {{0.5, 0.2}, {1, 0.1}}, {}}});
    expectGolden(tool::plotScript(picture, {}, "svg"), "plot_rates.txt");
}

TEST(PlotScript, DrawsALineForEachIteration) {
    tool::PictureChoice choice = bothPanels();
    choice.perIteration = true;
    const tool::Picture picture = tool::pictureOf(choice, {curve(2, {bad, good, best})}, {});
    expectGolden(tool::plotScript(picture, {}, "pdf"), "plot_iterations.txt");
}

TEST(PlotScript, DrawsAPanelAsLargeAsWanted) {
    tool::PictureChoice choice = bothPanels();
    choice.panels = {"bler"};
    choice.isOverEsN0 = true;
    choice.title = "";
    tool::FigureChoice figure;
    figure.width = 252;
    figure.height = 180;
    figure.fontSize = 8;
    figure.legend = "bottom-left";
    figure.x = tool::Range{-5, -3};
    figure.y = tool::Range{0.01, 0.09};
    figure.xLabel = "a_b";
    expectGolden(tool::plotScript(tool::pictureOf(choice, {curve(1, {bad, good})}, {}), figure, "png"),
                 "plot_panel.txt");
}

}  // namespace quarzel::test
