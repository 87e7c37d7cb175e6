// SPDX-License-Identifier: MIT
#pragma once

#include <map>

#include "sweep/point_state.hpp"
#include "sweep/setup.hpp"

namespace quarzel::sweep {

/// Points in their order.
using Points = std::map<Setup, PointState>;

}  // namespace quarzel::sweep
