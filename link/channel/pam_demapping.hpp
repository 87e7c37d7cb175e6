// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "link/channel/channel.hpp"
#include "link/mpfr_number.hpp"

namespace quarzel::link {

/// The variance of the noise of a component, in the unit of amplitudes.
Number componentVariance(Modulation modulation, Decibels ebN0, CodeRate rate);

/// The soft values of the bits of a component of a symbol before they are rounded, as functions of the
/// received value, with 128 bits.
class PamDemapping {
  public:
    PamDemapping(const ChannelSetup& setup, const Number& variance);

    std::size_t bits() const { return itsBits; }

    /// @param bit       0 the first bit of the component
    /// @param received  in the unit of amplitudes
    Number soft(std::size_t bit, const Number& received) const;

    /// Steps in which every soft value rises or falls all the way, but for a hundredth of its unit.
    double step() const { return itsStep; }

  private:
    Number exactSoft(std::size_t bit, const Number& received) const;
    Number maxLogSoft(std::size_t bit, const Number& received) const;

    bool hasBit(std::size_t level, std::size_t bit) const { return (level >> (itsBits - 1 - bit) & 1U) != 0; }

    std::vector<std::int8_t> itsLevels;
    std::size_t itsBits;
    bool itsIsExact;
    Number itsVariance;
    Number itsScale;                 ///< soft units for a log-likelihood ratio of 1
    std::vector<Number> itsWeights;  ///< exp(-a^2 / (2 variance)) of each level
    double itsStep;
};

}  // namespace quarzel::link
