// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "sweep/points.hpp"
#include "sweep/shard.hpp"
#include "vardel_ip_quarzel.h"

namespace quarzel::sweep {

/// Which part of which sweep a result is.
struct Part {
    Shard shard;
    std::string sweep;  ///< digest of all that the sweep asks for

    bool operator==(const Part&) const = default;
};

/// @return  none when the shard is the whole sweep
std::optional<Part> partOf(const Configuration& configuration, const Shard& shard);

/// A set of points. What is counted at a point depends on the seed, its setup and the number of its blocks
/// alone: not on threads, shards, interruptions or the machine. In the checkpoint of a sweep some points have
/// not ended.
struct Result {
    std::uint64_t seed = 1;
    Points points;
    std::optional<Part> part;                         ///< only in parts, which have to be joined
    std::string quarzel = VARDEL_IP_QUARZEL_VERSION;  ///< the version that wrote the file
};

/// The file of a result.
std::string resultText(const Result& result);

/// The JSON of a curve that has this point alone, in one line.
std::string pointText(const Setup& setup, const PointState& point);

/// Read the file of a result.
/// @throws Error when it is a part, or not a whole, unaltered result
Result readResult(std::string_view text);

/// Read the file of a result or a part.
/// @throws Error when it is not a whole, unaltered one
Result readResultOrPart(std::string_view text);

}  // namespace quarzel::sweep
