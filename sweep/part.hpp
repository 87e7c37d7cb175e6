// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "sweep/configuration.hpp"
#include "sweep/point_state.hpp"
#include "sweep/result.hpp"

namespace quarzel::sweep {

/// A part of a sweep: the checkpoint of an interrupted run, or a shard for the merge.
struct Part {
    Configuration configuration;
    Shard shard;
    std::vector<PointState> points;

    bool isComplete() const;
};

/// A part that has not begun.
Part freshPart(const Configuration& configuration, const Shard& shard);

/// The file of a part.
std::string partText(const Part& part);

/// Read the file of a part.
/// @throws Error when it is not a whole, unaltered part in this version of the format
Part readPart(std::string_view text);

/// Check that a part belongs to a run.
/// @throws Error that names the first difference when it does not
void requireSameRun(const Part& part, const Configuration& configuration, const Shard& shard);

/// The first thing in which two configurations differ, "seed 7 instead of 8"; empty when there is none.
std::string differenceOf(const Configuration& found, const Configuration& expected);

/// A complete part, and the name by which its user knows it.
struct NamedPart {
    std::string name;
    Part part;
};

/// Join all parts of a sweep. The result is that of a run without shards.
/// @throws Error when parts are missing, given twice, unfinished or of different sweeps
Result merge(const std::vector<NamedPart>& parts);

}  // namespace quarzel::sweep
