// SPDX-License-Identifier: MIT
#pragma once

#include "sweep/setup.hpp"
#include "sweep/stop_rule.hpp"

namespace quarzel::sweep {

/// How the block error rate of a curve usually falls. The numbers are fitted to the curves for K = 40, 1024
/// and 6144 in docs/curves.
struct Waterfall {
    double start;      ///< the Eb/N0 in dB at which about one block in ten is wrong
    double perDecade;  ///< how many dB further one in a hundred is
};
Waterfall usualWaterfall(const Setup& curve);

/// How long a point probably takes, in units of its own: the time to decode a block, times the blocks until
/// the rule ends the point at the block error rate that the code usually has there. Good to a factor of a
/// few. Computed with + - * / in double alone: every machine deals out the same points.
double predictedCost(const Setup& setup, const StopRule& rule);

}  // namespace quarzel::sweep
