// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "plot/legend.hpp"
#include "plot/picture.hpp"

/// Where the parts of a figure stand. All lengths are in points (1/72 inch), upwards from the lower left
/// corner.
namespace quarzel::tool {

/// What the user chooses of a figure.
struct FigureChoice {
    std::optional<double> width;
    std::optional<double> height;
    double fontSize = 10;
    std::string font;        ///< empty: one without serifs
    std::string legend;      ///< one of legendPlaces; empty: at the right or below, as there is room
    std::optional<Range> x;  ///< none: what the points need
    std::optional<Range> y;  ///< likewise
    std::optional<std::string> xLabel;  ///< none: what the axis shows
    std::optional<std::string> yLabel;  ///< likewise
};

constexpr std::array<const char*, 7> legendPlaces = {"right",       "below",        "top-left", "top-right",
                                                     "bottom-left", "bottom-right", "none"};

struct Box {
    double left;
    double bottom;
    double width;
    double height;
};

struct FigureLayout {
    double width;
    double height;
    std::vector<std::string> title;  ///< in lines
    std::vector<Box> panels;         ///< their frames; what is written at the axes stands around
    Legend legend;
    Box legendBox;
    bool isLegendInside;  ///< it covers a part of the last panel
};

/// What the axes show.
struct FigureAxes {
    Range x;               ///< of all panels
    std::vector<Range> y;  ///< of each panel
};

/// @throws ToolError when there is no room for the curves or the legend
FigureLayout layoutOf(const Picture& picture, const FigureChoice& choice);

FigureAxes axesOf(const Picture& picture, const FigureChoice& choice);

}  // namespace quarzel::tool
