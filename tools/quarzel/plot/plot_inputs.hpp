// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "plot/figure_layout.hpp"
#include "plot/picture.hpp"
#include "plot/reference_curve.hpp"
#include "plot/sweep_curves.hpp"

namespace quarzel::tool {

/// What the user of `quarzel plot` chooses.
struct PlotOptions {
    std::vector<std::string> results;
    std::string output;
    std::string csv;  ///< empty: none
    std::vector<std::string> references;
    std::vector<std::uint32_t> blockSizes;
    std::vector<int> units;
    std::vector<int> algorithms;
    std::vector<double> llrScales;
    std::vector<int> iterations;  ///< of curves; with perIteration the lines of one
    PictureChoice picture;
    FigureChoice figure;
    bool json = false;  ///< tell what is drawn
};

/// The curves of all results that the user wants, at least one.
/// @throws ToolError when there is none, or the iterations of one cannot be drawn as wanted
std::vector<SweepCurve> readCurves(const PlotOptions& options);

/// The references that the user wants.
std::vector<ReferenceCurve> readReferences(const PlotOptions& options);

}  // namespace quarzel::tool
