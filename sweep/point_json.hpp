// SPDX-License-Identifier: MIT
#pragma once

#include <utility>

#include "sweep/document.hpp"
#include "sweep/point_state.hpp"
#include "sweep/setup.hpp"

/// How files spell curves and points.
namespace quarzel::sweep {

/// What the points of a curve have in common.
Json curveJson(const Setup& setup);

/// The rest: Eb/N0, what was counted and the rates.
Json pointJson(const Setup& setup, const PointState& point);

/// Read a point of a curve.
/// @throws Error or another std::exception when it is none
std::pair<Setup, PointState> pointFrom(const Json& curve, const Json& point);

}  // namespace quarzel::sweep
