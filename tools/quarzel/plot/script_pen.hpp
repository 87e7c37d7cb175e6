// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "plot/curve_styles.hpp"
#include "plot/figure_layout.hpp"

namespace quarzel::tool {

/// The lines and marks of a gnuplot script, which terminals measure in different ways.
class ScriptPen {
  public:
    /// @param terminal  "svg", "png" or "pdf"
    ScriptPen(const std::string& terminal, const FigureLayout& layout, const FigureChoice& choice);

    /// The command that sets the terminal.
    const std::string& terminalCommand() const { return itsCommand; }

    /// "linewidth ..."
    /// @param width  in points
    std::string width(double width) const;

    /// The style of a curve's line.
    std::string line(const CurveStyle& style) const;

    /// The style of its bars, which are arrows with flat heads.
    std::string bars(const CurveStyle& style) const;

    /// The style of a mark.
    std::string mark(const std::string& colour, int mark) const;

  private:
    std::string itsCommand;
    double itsPoint;   ///< linewidth of 1 point
    double itsRadius;  ///< pointsize of a mark
    double itsHead;    ///< half the width of a bar's head, in widths of the figure
};

}  // namespace quarzel::tool
