// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "plot/picture.hpp"

namespace quarzel::tool {

/// What stands beside a text of the legend.
enum class Sample { curve, bars, bound, none };

struct LegendEntry {
    std::string text;
    Sample sample;
    std::size_t curve;  ///< of a panel, for its style
};

/// An entry in its place. All lengths are in points (1/72 inch).
struct PlacedEntry {
    LegendEntry entry;
    std::vector<std::string> lines;  ///< of its text
    double left;                     ///< from the left of the legend
    double top;                      ///< from the top of the legend, downwards
};

struct Legend {
    double width;
    double height;
    std::vector<PlacedEntry> entries;
};

/// The length of the sample of a line, in heights of the font.
constexpr double sampleWidth = 2.4;

/// What the legend of a picture holds: every curve that has a point, and what marks mean.
std::vector<LegendEntry> legendEntries(const Picture& picture);

/// Lay a legend out in as few rows as a width allows. A text that is wider is cut into lines.
/// @param fontSize  in points
/// @param width     in points
/// @param columns   at most so many
Legend placedLegend(const std::vector<LegendEntry>& entries, double fontSize, double width,
                    std::size_t columns);

}  // namespace quarzel::tool
