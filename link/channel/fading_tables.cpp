// SPDX-License-Identifier: MIT
#include "link/channel/fading_tables.hpp"

#include <vector>

#include "link/noise_tables.hpp"

namespace quarzel::link {

namespace {

/// Noise from -count steps to count steps, cut at each.
std::vector<std::uint64_t> noiseThresholds(int count, int steps) {
    const Number deviationRoot2 = rootOfTwice(Number(1));
    std::vector<std::uint64_t> thresholds;
    for (int i = -count; i <= count; ++i) {
        thresholds.push_back(probabilityAbove(Number(-i) / Number(steps), deviationRoot2));
    }
    return thresholds;
}

/// The probability of an amplitude below x is 1 - exp(-x^2).
std::vector<std::uint64_t> amplitudeThresholds(int count, int steps) {
    std::vector<std::uint64_t> thresholds;
    for (int i = 1; i <= count; ++i) {
        const Number x = Number(i) / Number(steps);
        Number below = applied(mpfr_expm1, Number(0) - x * x);
        mpfr_mul_2ui(below.get(), below.get(), channelBits, MPFR_RNDN);
        mpfr_neg(below.get(), below.get(), MPFR_RNDN);
        thresholds.push_back(mpfr_get_uj(below.get(), MPFR_RNDN));
    }
    return thresholds;
}

}  // namespace

const FadingTables& FadingTables::get() {
    static const FadingTables tables;
    return tables;
}

FadingTables::FadingTables()
    : itsNoise(noiseThresholds(noiseSteps, stepsOfNoise)),
      itsAmplitude(amplitudeThresholds(amplitudeSteps, stepsOfAmplitude)) {
    const FreedCache freedCache;
    for (std::size_t i = 0; i < itsCorrections.size(); ++i) {
        const Number x = Number(-static_cast<double>(i)) / Number(stepsOfCorrection);
        itsCorrections[i] = applied(mpfr_log1p, applied(mpfr_exp, x)).value();
    }
}

}  // namespace quarzel::link
