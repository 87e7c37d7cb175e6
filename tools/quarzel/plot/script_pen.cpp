// SPDX-License-Identifier: MIT
#include "plot/script_pen.hpp"

#include <fmt/format.h>

#include <cmath>

#include "plot/figure_text.hpp"

namespace quarzel::tool {

namespace {

constexpr double pngDotsPerInch = 300;

/// What gnuplot's terminals draw at linewidth and pointsize 1.
struct Units {
    double perInch;    ///< units of the size
    double linewidth;  ///< points
    double radius;     ///< points
    double font;       ///< points that a font size of 1 gives
};

Units unitsOf(const std::string& terminal) {
    if (terminal == "svg") {  // in CSS pixels
        return {96, 0.75, 4.1, 0.75};
    }
    if (terminal == "png") {  // in pixels, but fonts as if there were 96 to an inch
        return {pngDotsPerInch, 72 / pngDotsPerInch, 3.1 * 72 / pngDotsPerInch, 96 / pngDotsPerInch};
    }
    return {1, 0.5, 3.04, 1};
}

std::string commandOf(const std::string& terminal, const FigureLayout& layout, const std::string& font) {
    const double width = layout.width / 72;
    const double height = layout.height / 72;
    const double perInch = unitsOf(terminal).perInch;
    if (terminal == "pdf") {
        return fmt::format("set terminal pdfcairo size {:.4f}in,{:.4f}in font {}\n", width, height, font);
    }
    return fmt::format("set terminal {} size {},{} font {} background '#ffffff'\n",
                       terminal == "svg" ? "svg" : "pngcairo", std::lround(width * perInch),
                       std::lround(height * perInch), font);
}

}  // namespace

ScriptPen::ScriptPen(const std::string& terminal, const FigureLayout& layout, const FigureChoice& choice) {
    const Units units = unitsOf(terminal);
    const std::string family = !choice.font.empty() ? mendedText(choice.font)
                               : terminal == "svg"  ? "Arial"
                                                    : "Sans";
    itsCommand = commandOf(terminal, layout,
                           scriptText(fmt::format("{},{:.4g}", family, choice.fontSize / units.font)));
    itsPoint = 1 / units.linewidth;
    itsRadius = 0.26 * choice.fontSize / units.radius;
    itsHead = 0.25 * choice.fontSize / layout.width;
}

std::string ScriptPen::width(double width) const {
    return fmt::format("linewidth {:.3g}", width * itsPoint);
}

std::string ScriptPen::line(const CurveStyle& style) const {
    return fmt::format("dashtype {} {} linecolor rgb '{}'", style.dashes, width(1), style.colour);
}

std::string ScriptPen::bars(const CurveStyle& style) const {
    return fmt::format("heads size screen {:.3g},90 {} linecolor rgb '{}'", itsHead, width(0.6),
                       style.colour);
}

std::string ScriptPen::mark(const std::string& colour, int mark) const {
    const double size = mark == boundMark ? 1.4 : 1.0;
    return fmt::format("pointtype {} pointsize {:.3g} {} linecolor rgb '{}'", mark, size * itsRadius,
                       width(0.8), colour);
}

}  // namespace quarzel::tool
