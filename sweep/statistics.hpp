// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

#include "sweep/point_state.hpp"

namespace quarzel::sweep {

/// Within how many standard deviations a normal distribution lies with a probability of 95 %.
constexpr double deviations = 1.959963984540054;

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

/// An interval of the bit error rate that reaches 0 only where no error was seen, as on a logarithmic axis it
/// must not. The bit errors of a block are taken as one draw, since errors cluster in blocks. The ends solve
/// (ber - p)^2 = z^2 s p / n, where s is the measured variance over the mean of a draw and n the blocks: they
/// lie on both sides of the rate by the same factor. With + - * / and square roots alone, too. Without an
/// error it is that of ratesOf.
/// @param blockSize  K
Interval berScoreInterval(const PointState& point, std::uint32_t blockSize);

/// The rates of a point after its last iteration.
/// @param blockSize  K
Rates ratesOf(const PointState& point, std::uint32_t blockSize);

}  // namespace quarzel::sweep
