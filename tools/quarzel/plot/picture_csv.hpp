// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "plot/figure_layout.hpp"
#include "plot/picture.hpp"

namespace quarzel::tool {

/// The points of a picture that lie in its axes, as CSV. Without an error the rate is 0 and `high` the bound;
/// curves without intervals or counts leave those fields empty.
std::string pictureCsv(const Picture& picture, const FigureAxes& axes);

}  // namespace quarzel::tool
