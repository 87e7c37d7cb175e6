// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "plot/reference_curve.hpp"
#include "plot/sweep_curves.hpp"

namespace quarzel::tool {

/// A mark of a curve, or the bound that stands for it where no error was seen.
struct DrawnPoint {
    double x;     ///< Eb/N0 or Es/N0 in dB
    double rate;  ///< 0: no error
    double low;   ///< of the interval that holds the true rate with a probability of 95 %;
    double high;  ///< without an interval both are the rate
    std::uint64_t blocks = 0;
    std::uint64_t errors = 0;  ///< of bits or blocks
};

enum class CurveKind {
    measured,   ///< with intervals and bounds
    iteration,  ///< after an iteration; points without an error are not drawn
    reference,  ///< from elsewhere
    uncoded,    ///< a formula
};

/// As files spell it.
std::string_view nameOf(CurveKind kind);

struct DrawnCurve {
    std::string label;
    CurveKind kind;
    std::vector<DrawnPoint> points;
};

/// One of the rates, in axes of its own.
struct Panel {
    std::string name;  ///< "ber" or "bler"
    std::vector<DrawnCurve> curves;
};

/// An interval of an axis.
struct Range {
    double first;
    double last;
};

struct Picture {
    std::string title;
    bool isOverEsN0;
    std::vector<Panel> panels;  ///< one or two, with the same labels in the same order
};

/// What is to be drawn of curves.
struct PictureChoice {
    bool isOverEsN0 = false;
    bool uncoded = false;              ///< add uncoded BPSK
    std::optional<Range> x;            ///< over which uncoded BPSK is drawn; none: where the curves are
    bool perIteration = false;         ///< a line for each iteration of the only curve
    std::vector<int> iterations;       ///< with perIteration those to draw; none: all
    std::vector<std::string> labels;   ///< of the measured curves; none: what they differ in
    std::optional<std::string> title;  ///< none: what they share
    std::vector<std::string> panels;   ///< which rates: "ber", "bler" or both
};

/// A picture of measured curves and references.
/// @throws ToolError when there are not as many labels as curves
Picture pictureOf(const PictureChoice& choice, const std::vector<SweepCurve>& curves,
                  const std::vector<ReferenceCurve>& references);

/// The x values of all points.
Range xRangeOf(const Picture& picture);

}  // namespace quarzel::tool
