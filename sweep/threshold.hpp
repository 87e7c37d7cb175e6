// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "sweep/points.hpp"

namespace quarzel::sweep {

/// A block error rate that is looked for on a curve.
struct Target {
    Setup curve;       ///< what is decoded; its Eb/N0 means nothing
    int iterations;    ///< after which errors are counted, at most those that are decoded
    double rate;       ///< between 0 and 1
    double precision;  ///< half the width of the interval, in dB
};

/// The Eb/N0 at which a rate is reached, in dB, with an interval that holds it with a probability of 95 %.
struct Threshold {
    double ebN0;
    double low;
    double high;
};

/// A point and how many blocks of it are needed.
struct Need {
    Setup setup;
    std::uint64_t blocks;
};

/// Where a search stands: it needs more blocks, or has come to its end.
struct SearchState {
    std::vector<Need> needs;             ///< empty: the search has ended
    std::optional<Threshold> threshold;  ///< none at the end: the rate is not reached from -20 to 40 dB
};

/// Look for a threshold with the points that are known. On a grid of Eb/N0 a pair of neighbours is looked for
/// between which the rate is reached, from few blocks at each point. Then both get blocks until the interval
/// is narrow enough. Between them the logarithm of the rate is taken as straight. The interval comes from the
/// binomial variance of both counts and the slope between them.
///
/// It depends on the points alone, so that a search gives the same whoever decodes them.
/// @param points  with counts after every iteration, unless only those of the last one are looked at
SearchState stateOf(const Target& target, const Points& points);

}  // namespace quarzel::sweep
