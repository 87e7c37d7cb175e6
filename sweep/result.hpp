// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "sweep/configuration.hpp"
#include "sweep/point_state.hpp"

namespace quarzel::sweep {

/// What a result file says it is.
constexpr std::string_view resultFormat = "quarzel sweep result";

/// Blanks that a level of it is indented by.
constexpr int resultIndent = 1;

/// What comes of a sweep. It depends on the configuration alone: not on threads, shards or interruptions.
/// (With a time limit the clock decides how many blocks a point has.)
struct Result {
    Configuration configuration;
    std::vector<PointState> points;  ///< every one has ended
};

/// The result file.
std::string resultText(const Result& result);

/// A point as the result file tells it, a JSON object in one line.
/// @param number  of the point, see Configuration::points
/// @param point   has ended
std::string pointText(const Configuration& configuration, std::size_t number, const PointState& point);

/// Read a result file.
/// @throws Error when it is not a whole, unaltered result of this version
Result readResult(std::string_view text);

}  // namespace quarzel::sweep
