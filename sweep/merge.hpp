// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "sweep/result.hpp"

namespace quarzel::sweep {

/// A result or a part, and the name by which its user knows it.
struct NamedResult {
    std::string name;
    Result result;
};

/// Put the points of one result into another. Of a point that both have, the one with more blocks stays: its
/// first blocks are those of the other.
/// @throws Error when their seeds differ or a point contradicts the other
void join(NamedResult& to, const NamedResult& from);

/// Join results of one seed and all parts of sweeps.
/// @throws Error when they do not fit, or parts are missing, given twice or unfinished
Result merge(const std::vector<NamedResult>& results);

}  // namespace quarzel::sweep
