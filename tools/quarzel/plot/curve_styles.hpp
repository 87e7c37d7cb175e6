// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "plot/picture.hpp"

namespace quarzel::tool {

/// How a curve is drawn.
struct CurveStyle {
    std::string colour;  ///< "#rrggbb"
    int dashes;          ///< gnuplot's dashtype: 1 is a solid line
    int mark;            ///< gnuplot's pointtype; 0: none
};

/// The mark of a bound: a triangle that points down. No curve has it.
constexpr int boundMark = 10;

/// The styles of the curves of a panel. Measured curves are solid and no two share a colour; references are
/// dashed and grey. Up to seven colours are those of M. Okabe and K. Ito (2008), which people with any kind
/// of colour vision tell apart; more lie on a line from dark to light, so that they stay in order in grey,
/// too.
std::vector<CurveStyle> stylesOf(const Panel& panel);

}  // namespace quarzel::tool
