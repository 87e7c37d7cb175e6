// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

#include "sweep/point_state.hpp"
#include "sweep/setup.hpp"

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
    Interval berInterval;  ///< from the spread of the bit errors over blocks, since errors cluster in blocks.
                           ///< Its ends lie on both sides of the rate by the same factor; without an error it
                           ///< goes from 0 to where blerInterval ends
    Interval blerInterval;  ///< of E. B. Wilson (1927)
};

/// The rates of a point after its last iteration.
/// @param blockSize  K, or A of transport blocks
Rates ratesOf(const PointState& point, std::uint32_t blockSize);

/// The blocks that were sent in a transmission: those that the receiver has not accepted before.
/// @param transmission  from 0
std::uint64_t blocksSent(const PointState& point, std::size_t transmission);

/// The information bits of the blocks that are right at a count, for each coded bit that was sent until then.
/// @param count  one of the point's, from 0: a transmission, or an iteration of the only one
double throughput(const Setup& setup, const PointState& point, std::size_t count);

/// The iterations that a receiver with a stop rule used for a block in a transmission, on average; 0 where
/// there is none.
double meanIterations(const PointState& point);

}  // namespace quarzel::sweep
