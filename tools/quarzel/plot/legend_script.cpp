// SPDX-License-Identifier: MIT
#include "plot/legend_script.hpp"

#include "plot/figure_text.hpp"

namespace quarzel::tool {

namespace {

/// What stands beside the text of an entry.
/// @param y  the height of the middle of the text's first line
void addSample(Script& script, const PlacedEntry& placed, double y, const std::vector<CurveStyle>& styles,
               const ScriptPen& pen, double fontSize) {
    const double left = placed.left + 0.2 * fontSize;
    const double right = placed.left + sampleWidth * fontSize;
    const double middle = (left + right) / 2;
    const auto addMark = [&](const std::string& colour, int mark) {
        script.add("set label '' at {:.2f},{:.2f} point {}\n", middle, y, pen.mark(colour, mark));
    };
    switch (placed.entry.sample) {
        case Sample::curve: {
            const CurveStyle& style = styles[placed.entry.curve];
            script.add("set arrow from {:.2f},{:.2f} to {:.2f},{:.2f} nohead {}\n", left, y, right, y,
                       pen.line(style));
            if (style.mark != 0) {
                addMark(style.colour, style.mark);
            }
            break;
        }
        case Sample::bars:
            script.add("set arrow from {0:.2f},{1:.2f} to {0:.2f},{2:.2f} {3}\n", middle, y - 0.4 * fontSize,
                       y + 0.4 * fontSize, pen.bars({"#000000", 1, 0}));
            break;
        case Sample::bound:
            addMark("#000000", boundMark);
            break;
        case Sample::none:
            break;
    }
}

}  // namespace

void addMargins(Script& script, const FigureLayout& layout, const Box& box) {
    script.add(
        "set lmargin at screen {:.5f}; set rmargin at screen {:.5f}; set bmargin at screen {:.5f}; "
        "set tmargin at screen {:.5f}\n",
        box.left / layout.width, (box.left + box.width) / layout.width, box.bottom / layout.height,
        (box.bottom + box.height) / layout.height);
}

void addLegend(Script& script, const FigureLayout& layout, const std::vector<CurveStyle>& styles,
               const ScriptPen& pen, double fontSize) {
    addMargins(script, layout, layout.legendBox);
    const double height = layout.legendBox.height;
    script.add(
        "unset border; unset tics; unset grid; unset logscale y; unset label\n"
        "set xrange [0:{0:.2f}]; set yrange [0:{1:.2f}]\n",
        layout.legendBox.width, height);
    if (layout.isLegendInside) {
        script.add(
            "set object 1 rectangle from 0,0 to {:.2f},{:.2f} behind fillcolor rgb '#ffffff' "
            "fillstyle solid border linecolor rgb '{}'\n",
            layout.legendBox.width, height, ruleColour);
    }
    for (const PlacedEntry& placed : layout.legend.entries) {
        const double y = height - placed.top - lineHeight / 2 * fontSize;
        addSample(script, placed, y, styles, pen, fontSize);
        for (std::size_t i = 0; i < placed.lines.size(); ++i) {
            script.add("set label {} at {:.2f},{:.2f} left noenhanced\n", scriptText(placed.lines[i]),
                       placed.left + (sampleWidth + 0.5) * fontSize,
                       y - static_cast<double>(i) * lineHeight * fontSize);
        }
    }
    script.add("plot NaN\n");
}

}  // namespace quarzel::tool
