// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

#include "sweep/point_state.hpp"

namespace quarzel::sweep {

/// An interval that holds the true rate with a probability of 95 %.
struct Interval {
    double low;
    double high;
};

/// The error rates of a point. Computed with + - * / and square roots in double alone, so that they are the
/// same on every machine.
struct Rates {
    double ber;
    double bler;
    Interval berInterval;  ///< from the spread of the bit errors over blocks, since errors cluster in blocks;
                           ///< without an error it ends where blerInterval does
    Interval blerInterval;  ///< of E. B. Wilson (1927)
};

/// The rates of a point after its last iteration.
/// @param blockSize  K
Rates ratesOf(const PointState& point, std::uint32_t blockSize);

}  // namespace quarzel::sweep
