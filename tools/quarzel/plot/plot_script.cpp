// SPDX-License-Identifier: MIT
#include "plot/plot_script.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <iterator>
#include <limits>

namespace quarzel::tool {

namespace {

/// Colours that people with any kind of colour vision tell apart (M. Okabe and K. Ito, 2008).
constexpr std::array<const char*, 7> colours = {"#0072b2", "#d55e00", "#009e73", "#cc79a7",
                                                "#e69f00", "#56b4e9", "#000000"};
constexpr std::array<int, 7> marks = {7, 5, 9, 13, 11, 4, 6};
constexpr int boundMark = 10;  ///< a triangle that points down

/// Text as gnuplot takes it: in single quotes nothing has a meaning.
std::string quoted(const std::string& text) {
    std::string result = "'";
    for (const char c : text) {
        result += c == '\'' ? "''" : static_cast<unsigned char>(c) < ' ' ? " " : std::string(1, c);
    }
    return result + '\'';
}

/// The start of a script: the terminal, and sizes of marks that suit it.
std::string terminalCommand(const std::string& terminal) {
    if (terminal == "svg") {
        return "set terminal svg size 1100,480 font 'Arial,14' background '#ffffff'\n"
               "small = 0.4; large = 0.7\n";
    }
    return (terminal == "png" ? "set terminal pngcairo size 1650,720 font 'Sans,14'\n"
                              : "set terminal pdfcairo size 11in,4.8in font 'Sans,12'\n") +
           std::string("small = 0.7; large = 1.2\n");
}

bool isBound(const DrawnCurve& curve, const std::pair<double, MeasuredRate>& point) {
    return curve.hasIntervals && point.second.rate == 0;
}

/// Whether a picture has a curve with a point for which this holds.
template <class Predicate>
bool hasPoint(const Picture& picture, const Predicate& predicate) {
    for (const Panel& panel : picture.panels) {
        for (const DrawnCurve& curve : panel.curves) {
            for (const auto& point : curve.points) {
                if (predicate(curve, point)) {
                    return true;
                }
            }
        }
    }
    return false;
}

/// The Eb/N0 that the horizontal axes show, a little more than the points need.
std::pair<double, double> rangeOf(const Picture& picture) {
    double first = std::numeric_limits<double>::infinity();
    double last = -first;
    hasPoint(picture, [&](const DrawnCurve&, const std::pair<double, MeasuredRate>& point) {
        first = std::min(first, point.first);
        last = std::max(last, point.first);
        return false;
    });
    const double margin = first == last ? 0.5 : 0.04 * (last - first);
    return {first - margin, last + margin};
}

/// The power of ten below every mark of a panel.
double floorOf(const Panel& panel) {
    double lowest = 1;
    for (const DrawnCurve& curve : panel.curves) {
        for (const auto& [ebN0, rate] : curve.points) {
            const double mark = rate.rate > 0 ? rate.rate : rate.high;
            lowest = mark > 0 ? std::min(lowest, mark) : lowest;
        }
    }
    return std::pow(10, std::min(-1.0, std::floor(std::log10(lowest / 1.2))));
}

/// The data of a curve: one block of points with their intervals, one of upper bounds.
std::string dataOf(const DrawnCurve& curve, const std::string& name, double floor) {
    std::string points;
    std::string bounds;
    for (const auto& point : curve.points) {
        const auto& [ebN0, rate] = point;
        if (rate.rate > 0) {
            fmt::format_to(std::back_inserter(points), "{} {} {} {}\n", ebN0, rate.rate,
                           std::max(rate.low, floor), rate.high);
        } else if (isBound(curve, point)) {
            fmt::format_to(std::back_inserter(bounds), "{} {}\n", ebN0, rate.high);
        }
    }
    return fmt::format("$points_{0} << end\n{1}end\n$bounds_{0} << end\n{2}end\n", name, points, bounds);
}

std::string styleOf(const DrawnCurve& curve, std::size_t index) {
    if (curve.isReference) {
        return fmt::format("dashtype {} linewidth 1.5 linecolor rgb '#707070'", 2 + index % 4);
    }
    return fmt::format("dashtype {} linewidth 1.5 linecolor rgb '{}' pointtype {} pointsize small",
                       1 + index / colours.size(), colours[index % colours.size()],
                       marks[index % marks.size()]);
}

/// The parts of a plot command that draw a curve.
void appendPlots(std::vector<std::string>& plots, const DrawnCurve& curve, std::size_t index,
                 const std::string& name) {
    const bool hasPoints = std::any_of(curve.points.begin(), curve.points.end(),
                                       [](const auto& point) { return point.second.rate > 0; });
    const bool hasBounds = std::any_of(curve.points.begin(), curve.points.end(),
                                       [&](const auto& point) { return isBound(curve, point); });
    const std::string style = styleOf(curve, index);
    if (hasPoints) {
        plots.push_back(fmt::format("$points_{} using 1:2 with {} {} notitle", name,
                                    curve.isReference ? "lines" : "linespoints", style));
        if (curve.hasIntervals) {
            plots.push_back(fmt::format("$points_{} using 1:2:3:4 with yerrorbars {} notitle", name, style));
        }
    }
    if (hasBounds) {
        plots.push_back(
            fmt::format("$bounds_{} using 1:2 with points linecolor rgb '{}' pointtype {} "
                        "pointsize large notitle",
                        name, colours[index % colours.size()], boundMark));
    }
}

/// The legend stands beside the last panel and holds what all panels have in common.
void appendLegend(std::vector<std::string>& plots, const Picture& picture) {
    const std::vector<DrawnCurve>& curves = picture.panels.back().curves;
    for (std::size_t i = 0; i < curves.size(); ++i) {
        plots.push_back(fmt::format("keyentry with {} {} title {}",
                                    curves[i].isReference ? "lines" : "linespoints", styleOf(curves[i], i),
                                    quoted(curves[i].label)));
    }
    const auto hasInterval = [](const DrawnCurve& curve, const auto&) { return curve.hasIntervals; };
    if (hasPoint(picture, hasInterval)) {
        plots.emplace_back("keyentry with lines linecolor rgb '#ffffff' title 'bars: 95 % intervals'");
    }
    if (hasPoint(picture, isBound)) {
        plots.push_back(
            fmt::format("keyentry with points linecolor rgb '#000000' pointtype {} pointsize large "
                        "title 'no error: 95 % upper bound'",
                        boundMark));
    }
    const auto isLeftOut = [](const DrawnCurve& curve, const auto& point) {
        return !curve.hasIntervals && point.second.rate == 0;
    };
    if (hasPoint(picture, isLeftOut)) {
        plots.emplace_back(
            "keyentry with lines linecolor rgb '#ffffff' title 'points without an error: left out'");
    }
}

}  // namespace

std::string plotScript(const Picture& picture, const std::string& terminal) {
    const std::pair<double, double> range = rangeOf(picture);
    std::string script = terminalCommand(terminal);
    fmt::format_to(std::back_inserter(script),
                   "set encoding utf8\n"
                   "set pointintervalbox 0\n"
                   "set multiplot layout 1,{} title {} noenhanced margins 0.075,0.74,0.13,0.85 spacing 0.09\n"
                   "set logscale y\n"
                   "set format y '10^{{%T}}'\n"
                   "set grid xtics ytics linetype 1 linewidth 0.5 linecolor rgb '#d0d0d0'\n"
                   "set xlabel 'Eb/N0 in dB'\n"
                   "set xrange [{}:{}]\n"
                   "set key noenhanced at screen 0.75, 0.85 left top Left reverse samplen 2 spacing 1.2\n",
                   picture.panels.size(), quoted(picture.title), range.first, range.second);
    for (std::size_t p = 0; p < picture.panels.size(); ++p) {
        const Panel& panel = picture.panels[p];
        const double floor = floorOf(panel);
        std::vector<std::string> plots;
        for (std::size_t i = 0; i < panel.curves.size(); ++i) {
            const std::string name = fmt::format("{}_{}", p, i);
            script += dataOf(panel.curves[i], name, floor);
            appendPlots(plots, panel.curves[i], i, name);
        }
        if (plots.empty()) {
            plots.emplace_back("NaN notitle");  // axes without a curve
        }
        if (p + 1 == picture.panels.size()) {
            appendLegend(plots, picture);
        }
        fmt::format_to(std::back_inserter(script), "set title {}\nset yrange [{}:1]\nplot {}\n",
                       quoted(panel.name), floor, fmt::join(plots, ", \\\n     "));
    }
    return script + "unset multiplot\n";
}

}  // namespace quarzel::tool
