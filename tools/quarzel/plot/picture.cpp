// SPDX-License-Identifier: MIT
#include "plot/picture.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <cmath>
#include <limits>

#include "plot/curve_labels.hpp"
#include "plot/figure_text.hpp"
#include "plot/measured_points.hpp"
#include "report_text.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

double decibels(double ratio) {
    return 10 * std::log10(ratio);
}

/// Rates of measured curves: those after the last iteration, or a curve for each iteration.
std::vector<DrawnCurve> measuredCurves(const PictureChoice& choice, const std::vector<SweepCurve>& curves,
                                       const std::vector<std::string>& labels, const std::string& rate) {
    std::vector<DrawnCurve> drawn;
    if (!choice.perIteration) {
        for (std::size_t i = 0; i < curves.size(); ++i) {
            drawn.push_back({labels[i], CurveKind::measured, measuredPoints(curves[i], rate)});
        }
        return drawn;
    }
    const SweepCurve& curve = curves.front();
    for (int iteration = 1; iteration <= curve.iterations; ++iteration) {
        if (choice.iterations.empty() || std::find(choice.iterations.begin(), choice.iterations.end(),
                                                   iteration) != choice.iterations.end()) {
            const auto count = static_cast<std::size_t>(iteration);
            drawn.push_back({"after " + counted(count, "iteration", "iterations"), CurveKind::iteration,
                             pointsAfter(curve, rate, count)});
        }
    }
    return drawn;
}

void shift(std::vector<DrawnPoint>& points, double offset) {
    for (DrawnPoint& point : points) {
        point.x += offset;
    }
}

DrawnCurve referenceCurve(const ReferenceCurve& reference, const RatePoints& points, bool isOverEsN0) {
    DrawnCurve drawn{reference.label, CurveKind::reference, {}};
    for (const auto& [ebN0, rate] : points) {
        drawn.points.push_back({ebN0, rate, rate, rate});
    }
    if (isOverEsN0) {
        if (!reference.bitsPerSymbol) {
            throw ToolError(ExitCode::usage, "--x",
                            fmt::format("the reference '{}' does not tell its code rate", reference.label),
                            "give it the columns K and code_bits");
        }
        shift(drawn.points, decibels(*reference.bitsPerSymbol));
    }
    return drawn;
}

/// BPSK without a code, whose Es/N0 is its Eb/N0.
/// @param K  bits of a block; 1 for the bit error rate
DrawnCurve uncodedCurve(Range x, double K) {
    constexpr int steps = 100;
    DrawnCurve drawn{"uncoded BPSK", CurveKind::uncoded, {}};
    for (int i = 0; i <= steps; ++i) {
        const double at = x.first + (x.last - x.first) * i / steps;
        const double bit = std::erfc(std::sqrt(std::pow(10, at / 10))) / 2;
        const double rate = -std::expm1(K * std::log1p(-bit));
        drawn.points.push_back({at, rate, rate, rate});
    }
    return drawn;
}

void addUncoded(Picture& picture, const PictureChoice& choice, const std::vector<SweepCurve>& curves) {
    const Range x = choice.x.value_or(xRangeOf(picture));
    const std::uint32_t K = curves.front().blockSize;
    const bool isOneSize = std::all_of(curves.begin(), curves.end(),
                                       [K](const SweepCurve& curve) { return curve.blockSize == K; });
    for (Panel& panel : picture.panels) {
        DrawnCurve drawn = uncodedCurve(x, panel.name == "ber" ? 1 : K);
        if (panel.name == "bler" && !isOneSize) {
            drawn.points.clear();  // there is a curve for each block size
        }
        panel.curves.push_back(std::move(drawn));
    }
}

void relabel(std::vector<DrawnCurve>& curves, const std::vector<std::string>& labels) {
    if (labels.empty()) {
        return;
    }
    if (labels.size() != curves.size()) {
        throw ToolError(ExitCode::usage, "--label",
                        fmt::format("{} for {}", counted(labels.size(), "label", "labels"),
                                    counted(curves.size(), "curve", "curves")),
                        "give one for each curve, in the order of the legend");
    }
    for (std::size_t i = 0; i < curves.size(); ++i) {
        curves[i].label = labels[i];
    }
}

}  // namespace

std::string_view nameOf(CurveKind kind) {
    switch (kind) {
        case CurveKind::measured:
            return "measured";
        case CurveKind::iteration:
            return "iteration";
        case CurveKind::reference:
            return "reference";
        case CurveKind::uncoded:
            return "uncoded";
    }
    return "";
}

Picture pictureOf(const PictureChoice& choice, const std::vector<SweepCurve>& curves,
                  const std::vector<ReferenceCurve>& references) {
    const CurveLabels labels = labelsOf(curves);
    Picture picture{choice.title.value_or(labels.title), choice.isOverEsN0, {}};
    for (const std::string& rate : choice.panels) {
        Panel& panel =
            picture.panels.emplace_back(Panel{rate, measuredCurves(choice, curves, labels.labels, rate)});
        if (choice.isOverEsN0) {
            for (std::size_t i = 0; i < panel.curves.size(); ++i) {
                shift(panel.curves[i].points, decibels(curves[choice.perIteration ? 0 : i].bitsPerSymbol));
            }
        }
        relabel(panel.curves, choice.labels);
        for (const ReferenceCurve& reference : references) {
            panel.curves.push_back(
                referenceCurve(reference, rate == "ber" ? reference.ber : reference.bler, choice.isOverEsN0));
        }
    }
    if (choice.uncoded) {
        addUncoded(picture, choice, curves);
    }
    picture.title = mendedText(picture.title);
    for (Panel& panel : picture.panels) {
        for (DrawnCurve& curve : panel.curves) {
            curve.label = mendedText(curve.label);
        }
    }
    return picture;
}

Range xRangeOf(const Picture& picture) {
    Range range{std::numeric_limits<double>::infinity(), -std::numeric_limits<double>::infinity()};
    for (const Panel& panel : picture.panels) {
        for (const DrawnCurve& curve : panel.curves) {
            for (const DrawnPoint& point : curve.points) {
                range = {std::min(range.first, point.x), std::max(range.last, point.x)};
            }
        }
    }
    return range;
}

}  // namespace quarzel::tool
