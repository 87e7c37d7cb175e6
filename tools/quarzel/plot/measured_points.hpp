// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "plot/picture.hpp"

namespace quarzel::tool {

/// The points of a curve after its last iteration, over Eb/N0. Where no error was seen, the bound of the bit
/// error rate is that of the block error rate, times the share of wrong bits in a wrong block at the nearest
/// point that has any.
/// @param rate  "ber" or "bler"
std::vector<DrawnPoint> measuredPoints(const SweepCurve& curve, const std::string& rate);

/// The points of a curve after one of its iterations, without intervals.
/// @param curve      one that has counts for every iteration
/// @param iteration  from 1
std::vector<DrawnPoint> pointsAfter(const SweepCurve& curve, const std::string& rate, std::size_t iteration);

}  // namespace quarzel::tool
