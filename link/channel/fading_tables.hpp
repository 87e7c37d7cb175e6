// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>

#include "link/channel/draw_table.hpp"

namespace quarzel::link {

/// The distributions of fading channels as tables, which are made once, on first use, with numbers of 128
/// bits.
class FadingTables {
  public:
    static const FadingTables& get();

    /// Gaussian noise with a variance of 1, in steps of 1/128.
    double noise(Draws& draws) const {
        return (static_cast<double>(draws.next(itsNoise)) - noiseSteps - 0.5) / stepsOfNoise;
    }

    /// Rayleigh's amplitude with a mean square of 1, in steps of 1/1024.
    double amplitude(Draws& draws) const {
        return (static_cast<double>(draws.next(itsAmplitude)) + 0.5) / stepsOfAmplitude;
    }

    /// ln(e^a + e^b), to 1e-5.
    double logSum(double a, double b) const {
        const double greater = a > b ? a : b;
        const double distance = a > b ? a - b : b - a;
        if (distance >= correctionEnd) {
            return greater;
        }
        const double place = distance * stepsOfCorrection;
        const auto step = static_cast<std::size_t>(place);
        const double part = place - static_cast<double>(step);
        return greater + (itsCorrections[step] + part * (itsCorrections[step + 1] - itsCorrections[step]));
    }

  private:
    FadingTables();

    static constexpr int stepsOfNoise = 128;
    static constexpr int noiseSteps = 1050;  ///< on either side; there is no more in 2^48
    static constexpr int stepsOfAmplitude = 1024;
    static constexpr int amplitudeSteps = 6000;
    static constexpr int stepsOfCorrection = 64;
    static constexpr int correctionEnd = 16;

    DrawTable itsNoise;
    DrawTable itsAmplitude;
    /// ln(1 + e^-x) at each step
    std::array<double, static_cast<std::size_t>(correctionEnd) * stepsOfCorrection + 1> itsCorrections;
};

}  // namespace quarzel::link
