// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <vector>

#include "link/channel/channel.hpp"
#include "link/channel/fading_tables.hpp"

namespace quarzel::link {

/// A modulation over flat Rayleigh fading, whose amplitude the receiver knows, and additive white Gaussian
/// noise. Amplitudes and noise are drawn from tables in small steps; the rest are sums and products, so it is
/// the same on every machine.
class FadingChannel : public Channel {
  public:
    FadingChannel(const ChannelSetup& setup, Decibels ebN0, CodeRate rate);

    void transmit(const RandomSource& source, const std::uint8_t* codedBits, unsigned lane, std::size_t count,
                  std::int8_t* soft) const override;

  private:
    static constexpr std::size_t maxBits = 4;
    using Ratios = std::array<double, maxBits>;

    /// The log-likelihood ratios of the bits of a component, for a received value and an amplitude.
    template <class Join>
    Ratios ratios(double received, double amplitude, Join join) const;
    Ratios ratios(double received, double amplitude) const;

    const FadingTables& itsTables;
    Fading itsFading;
    bool itsIsExact;
    std::size_t itsComponents;  ///< of a symbol
    std::size_t itsBits;        ///< of a component
    std::vector<double> itsLevels;
    double itsDeviation = 0;        ///< of the noise, in the unit of amplitudes
    double itsInverseVariance = 0;  ///< of the noise
    double itsScale = 0;            ///< soft units for a log-likelihood ratio of 1
};

}  // namespace quarzel::link
