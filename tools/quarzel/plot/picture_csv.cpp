// SPDX-License-Identifier: MIT
#include "plot/picture_csv.hpp"

#include <fmt/format.h>

namespace quarzel::tool {

namespace {

std::string quoted(const std::string& text) {
    std::string result = "\"";
    for (const char c : text) {
        result += c == '"' ? "\"\"" : std::string(1, c);
    }
    return result + '"';
}

bool isIn(const Range& range, double value) {
    return range.first <= value && value <= range.last;
}

}  // namespace

std::string pictureCsv(const Picture& picture, const FigureAxes& axes) {
    std::string csv = fmt::format("rate,curve,kind,{},value,low,high,blocks,errors\n",
                                  picture.isOverEsN0 ? "esn0_db" : "ebn0_db");
    for (std::size_t p = 0; p < picture.panels.size(); ++p) {
        for (const DrawnCurve& curve : picture.panels[p].curves) {
            for (const DrawnPoint& point : curve.points) {
                if (!isIn(axes.x, point.x) || !isIn(axes.y[p], point.rate > 0 ? point.rate : point.high)) {
                    continue;
                }
                csv += fmt::format("{},{},{},{:.9g},{},", picture.panels[p].name, quoted(curve.label),
                                   nameOf(curve.kind), point.x, point.rate);
                csv +=
                    curve.kind == CurveKind::measured ? fmt::format("{},{},", point.low, point.high) : ",,";
                csv += point.blocks > 0 ? fmt::format("{},{}\n", point.blocks, point.errors) : ",\n";
            }
        }
    }
    return csv;
}

}  // namespace quarzel::tool
