// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

#include "plot/sweep_curves.hpp"

namespace quarzel::tool {

/// Join the curves that were measured alike over several ranges of Eb/N0, so that each is one line.
///
/// Two curves are one when their block size, core, iterations and quantiser are the same. At an Eb/N0 that
/// both have, they must also have one seed; the point with more blocks, which contains the other, is taken.
/// Points of as many blocks with other errors are not one measurement, and the curves stay apart.
/// @return the curves in the order of their first parts, the points in ascending order
std::vector<SweepCurve> joinedCurves(std::vector<SweepCurve> curves);

}  // namespace quarzel::tool
