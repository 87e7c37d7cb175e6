// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "sweep/configuration.hpp"
#include "sweep/point_state.hpp"
#include "vardel_ip_quarzel.h"

namespace quarzel::sweep {

/// The format that a result file names.
constexpr std::string_view resultFormat = "quarzel sweep result";

/// Its indentation, in blanks a level.
constexpr int resultIndent = 1;

/// The result of a sweep. It depends on the configuration alone: not on threads, shards or interruptions.
/// (With a time limit the clock decides how many blocks a point has.)
struct Result {
    Configuration configuration;
    std::vector<PointState> points;                   ///< every one has ended
    std::string quarzel = VARDEL_IP_QUARZEL_VERSION;  ///< the version that wrote the file
};

/// The result file.
std::string resultText(const Result& result);

/// A point as it is in the result file, a JSON object in one line.
/// @param number  of the point, see Configuration::points
/// @param point   one that has ended
std::string pointText(const Configuration& configuration, std::size_t number, const PointState& point);

/// Read a result file.
/// @throws Error when it is not a whole, unaltered result in this version of the format
Result readResult(std::string_view text);

}  // namespace quarzel::sweep
