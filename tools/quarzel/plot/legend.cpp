// SPDX-License-Identifier: MIT
#include "plot/legend.hpp"

#include <algorithm>

#include "plot/figure_text.hpp"

namespace quarzel::tool {

namespace {

constexpr double gapBeforeText = 0.5;
constexpr double gapBetweenColumns = 1.0;
constexpr double widestText = 34;  // longer ones are cut into lines where there is room for two columns

template <class Predicate>
bool hasPoint(const Picture& picture, const Predicate& predicate) {
    return std::any_of(picture.panels.begin(), picture.panels.end(), [&](const Panel& panel) {
        return std::any_of(panel.curves.begin(), panel.curves.end(), [&](const DrawnCurve& curve) {
            return std::any_of(curve.points.begin(), curve.points.end(),
                               [&](const DrawnPoint& point) { return predicate(curve, point); });
        });
    });
}

}  // namespace

std::vector<LegendEntry> legendEntries(const Picture& picture) {
    std::vector<LegendEntry> entries;
    for (std::size_t i = 0; i < picture.panels.front().curves.size(); ++i) {
        if (std::any_of(picture.panels.begin(), picture.panels.end(),
                        [i](const Panel& panel) { return !panel.curves[i].points.empty(); })) {
            entries.push_back({picture.panels.front().curves[i].label, Sample::curve, i});
        }
    }
    const auto isMeasured = [](const DrawnCurve& curve) { return curve.kind == CurveKind::measured; };
    if (hasPoint(picture,
                 [&](const auto& curve, const auto& point) { return isMeasured(curve) && point.rate > 0; })) {
        entries.push_back({"95 % interval", Sample::bars, 0});
    }
    if (hasPoint(picture, [&](const auto& curve, const auto& point) {
            return isMeasured(curve) && point.rate == 0;
        })) {
        entries.push_back({"no error: 95 % upper bound", Sample::bound, 0});
    }
    if (hasPoint(picture, [](const auto& curve, const auto& point) {
            return curve.kind == CurveKind::iteration && point.rate == 0;
        })) {
        entries.push_back({"points without an error: left out", Sample::none, 0});
    }
    return entries;
}

Legend placedLegend(const std::vector<LegendEntry>& entries, double fontSize, double width,
                    std::size_t columns) {
    double widest = 0;
    for (const LegendEntry& entry : entries) {
        widest = std::max(widest, widthOf(entry.text));
    }
    const double before = sampleWidth + gapBeforeText;
    const double available = width / fontSize;
    const double whole = before + widest + gapBetweenColumns;
    const double cut = before + std::min(widest, widestText) + gapBetweenColumns;
    const double column = columns > 1 && 2 * cut <= available ? cut : std::min(whole, available);
    columns = std::clamp<std::size_t>(static_cast<std::size_t>(available / column), 1, columns);
    const std::size_t rows = (entries.size() + columns - 1) / columns;

    Legend legend{0, 0, {}};
    double top = 0;
    for (std::size_t i = 0; i < entries.size(); ++i) {
        if (i % rows == 0) {
            top = 0;
        }
        const double left = static_cast<double>(i / rows) * column;
        std::vector<std::string> lines = wrapped(entries[i].text, column - before);
        const double height = static_cast<double>(lines.size()) * lineHeight;
        legend.entries.push_back({entries[i], std::move(lines), left * fontSize, top * fontSize});
        top += height;
        legend.width = std::max(legend.width, (left + column) * fontSize);
        legend.height = std::max(legend.height, top * fontSize);
    }
    return legend;
}

}  // namespace quarzel::tool
