// SPDX-License-Identifier: MIT
#include "plot/curve_styles.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <cmath>

namespace quarzel::tool {

namespace {

constexpr std::array<const char*, 7> colours = {"#0072b2", "#d55e00", "#009e73", "#cc79a7",
                                                "#000000", "#e69f00", "#56b4e9"};

using Colour = std::array<double, 3>;

/// Corners of the line of colours, which grow lighter.
constexpr std::array<Colour, 6> line = {
    {{13, 8, 135}, {100, 0, 167}, {166, 32, 152}, {213, 84, 110}, {245, 136, 70}, {245, 185, 40}}};

constexpr std::array<int, 9> marks = {7, 5, 9, 13, 15, 6, 4, 12, 14};
constexpr std::array<int, 4> referenceMarks = {4, 8, 12, 14};
constexpr std::array<const char*, 3> greys = {"#404040", "#808080", "#606060"};

std::string colourAt(double place) {
    const double position = place * (line.size() - 1);
    const auto corner = std::min(static_cast<std::size_t>(position), line.size() - 2);
    std::string colour = "#";
    for (std::size_t i = 0; i < 3; ++i) {
        const double value =
            std::lerp(line[corner][i], line[corner + 1][i], position - static_cast<double>(corner));
        colour += fmt::format("{:02x}", std::lround(value));
    }
    return colour;
}

std::string colourOf(std::size_t index, std::size_t count) {
    return count <= colours.size() ? colours[index]
                                   : colourAt(static_cast<double>(index) / static_cast<double>(count - 1));
}

}  // namespace

std::vector<CurveStyle> stylesOf(const Panel& panel) {
    const auto isMeasured = [](const DrawnCurve& curve) {
        return curve.kind == CurveKind::measured || curve.kind == CurveKind::iteration;
    };
    const auto measured =
        static_cast<std::size_t>(std::count_if(panel.curves.begin(), panel.curves.end(), isMeasured));
    std::vector<CurveStyle> styles;
    std::size_t references = 0;
    for (const DrawnCurve& curve : panel.curves) {
        const std::size_t i = styles.size();
        if (isMeasured(curve)) {
            styles.push_back({colourOf(i, measured), 1, marks[i % marks.size()]});
        } else if (curve.kind == CurveKind::reference) {
            styles.push_back({greys[references % greys.size()], 2 + static_cast<int>(references % 4),
                              referenceMarks[references % referenceMarks.size()]});
            ++references;
        } else {
            styles.push_back({"#a0a0a0", 1, 0});
        }
    }
    return styles;
}

}  // namespace quarzel::tool
