// SPDX-License-Identifier: MIT
#include "plot/plot_script.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <cmath>

#include "plot/figure_text.hpp"
#include "plot/legend_script.hpp"
#include "plot/script.hpp"
#include "plot/script_pen.hpp"

namespace quarzel::tool {

namespace {

/// The smallest of 1, 2 and 5 times a power of ten that divides a range into at most so many parts.
double stepOf(const Range& range, double parts) {
    const double least = (range.last - range.first) / parts;
    const double power = std::pow(10, std::floor(std::log10(least)));
    for (const double digit : {1.0, 2.0, 5.0}) {
        if (digit * power >= least * 0.999) {
            return digit * power;
        }
    }
    return 10 * power;
}

/// Numbers at the axes as close as there is room for them.
void addAxes(Script& script, const Box& box, const Range& x, const Range& y, double fontSize) {
    script.add("set xrange [{}:{}]\nset xtics {:.6g}\n", x.first, x.last,
               stepOf(x, std::max(2.0, box.width / (3.6 * fontSize))));
    const double decades = std::log10(y.last / y.first);
    script.add("set yrange [{}:{}]\n", y.first, y.last);
    if (decades >= 1) {
        script.add("set format y '10^{{%T}}'\nset ytics {:.6g}\n",
                   std::pow(10, std::ceil(decades * 1.8 * fontSize / box.height)));
        return;
    }
    std::vector<double> numbers;
    for (double power = std::pow(10, std::floor(std::log10(y.first))); power <= y.last; power *= 10) {
        for (const double digit : {1, 2, 3, 5, 7}) {
            numbers.push_back(digit * power);
        }
    }
    script.add("set format y '%g'\nset ytics ({:.6g})\n", fmt::join(numbers, ","));
}

/// A curve's data: its points for marks and lines, and its bounds.
void addData(Script& script, const DrawnCurve& curve, const std::string& name, double floor) {
    script.add("$points_{} << end\n", name);
    for (const DrawnPoint& point : curve.points) {
        if (point.rate > 0) {
            script.add("{} {} {} {}\n", point.x, point.rate, std::max(point.low, floor), point.high);
        }
    }
    script.add("end\n$bounds_{} << end\n", name);
    for (const DrawnPoint& point : curve.points) {
        if (point.rate == 0) {
            script.add("{} {}\n", point.x, point.high);
        }
    }
    script.add("end\n");
}

/// The parts of a plot command that draw a curve: bars below, marks above.
void appendPlots(std::vector<std::string>& plots, const DrawnCurve& curve, const std::string& name,
                 const CurveStyle& style, const ScriptPen& pen) {
    const auto seen = [](const DrawnPoint& point) { return point.rate > 0; };
    const bool isMeasured = curve.kind == CurveKind::measured;
    if (std::any_of(curve.points.begin(), curve.points.end(), seen)) {
        if (isMeasured) {
            plots.push_back(
                fmt::format("$points_{} using 1:3:(0):($4-$3) with vectors {}", name, pen.bars(style)));
        }
        plots.push_back(fmt::format("$points_{} using 1:2 with lines {}", name, pen.line(style)));
        if (style.mark != 0) {
            plots.push_back(
                fmt::format("$points_{} using 1:2 with points {}", name, pen.mark(style.colour, style.mark)));
        }
    }
    if (isMeasured && !std::all_of(curve.points.begin(), curve.points.end(), seen)) {
        plots.push_back(
            fmt::format("$bounds_{} using 1:2 with points {}", name, pen.mark(style.colour, boundMark)));
    }
}

void addPanel(Script& script, const Panel& panel, const std::string& name, double floor,
              const ScriptPen& pen) {
    const std::vector<CurveStyle> styles = stylesOf(panel);
    std::vector<std::string> plots;
    for (std::size_t i = 0; i < panel.curves.size(); ++i) {
        const std::string data = fmt::format("{}_{}", name, i);
        addData(script, panel.curves[i], data, floor);
        appendPlots(plots, panel.curves[i], data, styles[i], pen);
    }
    if (plots.empty()) {
        plots.emplace_back("NaN");  // axes without a curve
    }
    script.add("plot {}\n", fmt::join(plots, ", \\\n     "));
}

/// The labels of the axes, in places of their own: terminals put those of gnuplot in different ones.
void addAxisLabels(Script& script, const Picture& picture, std::size_t panel, const FigureLayout& layout,
                   const FigureChoice& choice) {
    const auto textOf = [](const std::optional<std::string>& label, const std::string& usual) {
        return label ? scriptText(mendedText(*label)) + " noenhanced" : '\'' + usual + '\'';
    };
    const Box& box = layout.panels[panel];
    const std::string x =
        fmt::format("{{/:Italic E}}_{}/{{/:Italic N}}_0\u00a0(dB)", picture.isOverEsN0 ? "s" : "b");
    script.add("set label 1 {} at graph 0.5, screen {:.5f} center\n", textOf(choice.xLabel, x),
               (box.bottom - 2.6 * choice.fontSize) / layout.height);
    script.add(
        "set label 2 {} at screen {:.5f}, graph 0.5 center rotate by 90\n",
        textOf(choice.yLabel, picture.panels[panel].name == "ber" ? "Bit error rate" : "Block error rate"),
        (box.left - 3.8 * choice.fontSize) / layout.width);
}

}  // namespace

std::string plotScript(const Picture& picture, const FigureChoice& choice, const std::string& terminal) {
    const FigureLayout layout = layoutOf(picture, choice);
    const FigureAxes axes = axesOf(picture, choice);
    const ScriptPen pen(terminal, layout, choice);
    Script script;
    script.add(
        "{}set encoding utf8\nset multiplot\nunset key\nset logscale y\nset border {}\nset tics scale "
        "0.6,0.3\n"
        "set grid xtics ytics linetype 1 {} linecolor rgb '{}'\n",
        pen.terminalCommand(), pen.width(0.6), pen.width(0.4), ruleColour);
    for (std::size_t i = 0; i < layout.title.size(); ++i) {
        script.add("set label {} {} at screen 0.5,{:.5f} center noenhanced\n", 3 + i,
                   scriptText(layout.title[i]),
                   1 - (0.3 + (static_cast<double>(i) + 0.5) * lineHeight) * choice.fontSize / layout.height);
    }
    for (std::size_t p = 0; p < picture.panels.size(); ++p) {
        const Panel& panel = picture.panels[p];
        addMargins(script, layout, layout.panels[p]);
        addAxes(script, layout.panels[p], axes.x, axes.y[p], choice.fontSize);
        addAxisLabels(script, picture, p, layout, choice);
        addPanel(script, panel, std::to_string(p), axes.y[p].first, pen);
        script.add("unset label\n");
    }
    if (!layout.legend.entries.empty()) {
        addLegend(script, layout, stylesOf(picture.panels.front()), pen, choice.fontSize);
    }
    script.add("unset multiplot\n");
    return script.text();
}

}  // namespace quarzel::tool
