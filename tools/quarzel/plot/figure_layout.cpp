// SPDX-License-Identifier: MIT
#include "plot/figure_layout.hpp"

#include <algorithm>
#include <cmath>

#include "plot/figure_text.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr double inch = 72;

// In heights of the font.
constexpr double besideFrame = 4.8;  // label and numbers of the vertical axis
constexpr double belowFrame = 3.5;   // likewise of the horizontal axis
constexpr double margin = 0.9;       // holds half a number
constexpr double smallestPanel = 6;

/// The legend stands beside the panels when it is no wider than this share of the figure.
constexpr double legendShare = 0.36;

ToolError noRoom(const std::string& subject, const std::string& problem) {
    return {ExitCode::usage, subject, problem,
            "give a larger --size, a smaller --font-size or --legend none"};
}

/// The legend where the user wants it or, without a wish, where there is room.
std::string placeLegend(FigureLayout& layout, const FigureChoice& choice,
                        const std::vector<LegendEntry>& entries, double room) {
    const double fontSize = choice.fontSize;
    if (choice.legend == "none") {
        layout.legend = {0, 0, {}};
        return choice.legend;
    }
    if (choice.legend.empty() || choice.legend == "right") {
        const double share = choice.legend.empty() ? legendShare : 0.6;
        layout.legend = placedLegend(entries, fontSize, share * layout.width, 1);
        const bool isCut = std::any_of(layout.legend.entries.begin(), layout.legend.entries.end(),
                                       [](const PlacedEntry& entry) { return entry.lines.size() > 1; });
        if (choice.legend == "right" || (!isCut && (!choice.height || layout.legend.height <= room))) {
            return "right";
        }
    }
    layout.legend = placedLegend(entries, fontSize, layout.width - 2 * margin * fontSize, entries.size());
    return "below";
}

/// The box of a legend in a corner of a panel.
Box cornerOf(const Box& panel, const Legend& legend, const std::string& place, double fontSize) {
    const double gap = 0.6 * fontSize;
    const double left =
        place.ends_with("left") ? panel.left + gap : panel.left + panel.width - gap - legend.width;
    const double bottom =
        place.starts_with("bottom") ? panel.bottom + gap : panel.bottom + panel.height - gap - legend.height;
    return {left, bottom, legend.width, legend.height};
}

/// The power of ten below every mark of a panel.
double floorOf(const Panel& panel) {
    double lowest = 1;
    for (const DrawnCurve& curve : panel.curves) {
        for (const DrawnPoint& point : curve.points) {
            const double mark = point.rate > 0 ? point.rate : point.high;
            if (curve.kind != CurveKind::uncoded && mark > 0) {
                lowest = std::min(lowest, mark);
            }
        }
    }
    return std::pow(10, std::min(-1.0, std::floor(std::log10(lowest / 1.5))));
}

}  // namespace

FigureLayout layoutOf(const Picture& picture, const FigureChoice& choice) {
    const double fontSize = choice.fontSize;
    const auto panels = static_cast<double>(picture.panels.size());
    FigureLayout layout{};
    layout.width = choice.width.value_or(picture.panels.size() > 1 ? 11 * inch : 7 * inch);
    layout.height = choice.height.value_or(layout.width * (picture.panels.size() > 1 ? 0.4 : 0.6));
    layout.title = wrapped(picture.title, layout.width / fontSize - 2 * margin);
    const double title =
        layout.title.empty() ? 0 : static_cast<double>(layout.title.size()) * lineHeight + 0.4;
    const double above = (title + margin) * fontSize;

    const std::vector<LegendEntry> entries = legendEntries(picture);
    const bool isInside = choice.legend.find('-') != std::string::npos;
    const std::string place =
        isInside ? choice.legend : placeLegend(layout, choice, entries, layout.height - above);
    if (!choice.height && place == "below") {
        layout.height += layout.legend.height;
    } else if (!choice.height && place == "right") {
        layout.height = std::max(layout.height, layout.legend.height + above + margin * fontSize);
    }
    const double below =
        (place == "below" ? layout.legend.height + 0.5 * fontSize : 0) + belowFrame * fontSize;
    const double right = margin * fontSize + (place == "right" ? layout.legend.width : 0);
    const double stride = (layout.width - right + margin * fontSize) / panels;
    const Box first = {besideFrame * fontSize, below, stride - (besideFrame + margin) * fontSize,
                       layout.height - above - below};
    if (first.width < smallestPanel * fontSize || first.height < smallestPanel * fontSize) {
        throw noRoom("--size", "there is no room for the curves");
    }
    for (std::size_t i = 0; i < picture.panels.size(); ++i) {
        layout.panels.push_back(first);
        layout.panels.back().left += static_cast<double>(i) * stride;
    }
    const Box& last = layout.panels.back();
    if (isInside) {
        layout.isLegendInside = true;
        layout.legend = placedLegend(entries, fontSize, last.width - 2 * fontSize, 1);
        layout.legendBox = cornerOf(last, layout.legend, place, fontSize);
        if (layout.legendBox.height > last.height - 1.2 * fontSize) {
            throw noRoom("--legend", "the legend does not fit in the panel");
        }
    } else if (place == "right") {
        layout.legendBox = {last.left + last.width + margin * fontSize,
                            last.bottom + last.height - layout.legend.height, layout.legend.width,
                            layout.legend.height};
        if (layout.legendBox.bottom < 0) {
            throw noRoom("--legend", "the legend is higher than the figure");
        }
    } else {
        layout.legendBox = {(layout.width - layout.legend.width) / 2, 0.4 * fontSize, layout.legend.width,
                            layout.legend.height};
    }
    return layout;
}

FigureAxes axesOf(const Picture& picture, const FigureChoice& choice) {
    const Range points = xRangeOf(picture);
    const double besides = points.first == points.last ? 0.5 : 0.04 * (points.last - points.first);
    FigureAxes axes{choice.x.value_or(Range{points.first - besides, points.last + besides}), {}};
    for (const Panel& panel : picture.panels) {
        axes.y.push_back(choice.y.value_or(Range{floorOf(panel), 1}));
    }
    return axes;
}

}  // namespace quarzel::tool
