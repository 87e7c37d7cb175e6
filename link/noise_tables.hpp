// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

#include "link/channel_thresholds.hpp"
#include "link/mpfr_number.hpp"

/// What the tables of all channels are made of.
namespace quarzel::link {

/// 1 / (2 R Eb/N0), the variance of the noise at an amplitude of 1.
Number exactNoiseVariance(Decibels ebN0, CodeRate rate);

/// The square root of 2 times a variance.
Number rootOfTwice(const Number& variance);

/// 2^48 times the probability that Gaussian noise is above a distance, rounded to the nearest whole number.
/// @param deviationRoot2  the deviation of the noise times the square root of 2
std::uint64_t probabilityAbove(const Number& distance, const Number& deviationRoot2);

}  // namespace quarzel::link
