// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <ostream>
#include <vector>

#include "sweep/threshold.hpp"
#include "sweeps/sweep_table.hpp"

namespace quarzel::tool {

/// What was looked for and, if it is there, found.
struct FoundThreshold {
    sweep::Target target;
    std::optional<sweep::Threshold> threshold;
};

/// Print thresholds, in dB to three decimals.
/// @param seed  that they were found with
void printThresholds(std::ostream& stream, std::uint64_t seed, const std::vector<FoundThreshold>& found,
                     SweepForm form);

}  // namespace quarzel::tool
