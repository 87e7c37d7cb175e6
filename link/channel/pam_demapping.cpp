// SPDX-License-Identifier: MIT
#include "link/channel/pam_demapping.hpp"

#include <algorithm>
#include <array>
#include <bit>

#include "link/modulation/modulation.hpp"
#include "link/noise_tables.hpp"

namespace quarzel::link {

namespace {

constexpr double coarsestStep = 1;  // between whole numbers max-log ratios are straight
constexpr double finestStep = 1.0 / 1024;

/// A ratio bends by at most 4 / variance^2 times the square of the distance of two amplitudes, 2.
double stepFor(double variance) {
    double step = coarsestStep / 8;
    while (step > finestStep && step > variance / 16) {
        step /= 2;
    }
    return step;
}

}  // namespace

Number componentVariance(Modulation modulation, Decibels ebN0, CodeRate rate) {
    // A symbol has the energy of Q_m coded bits, and its amplitudes a mean square of their own.
    const auto levels = amplitudes(modulation);
    long energy = 0;
    for (const std::int8_t level : levels) {
        energy += long{level} * level;
    }
    const double components = modulation == Modulation::bpsk ? 1 : 2;
    const Number ratio(components * static_cast<double>(energy) /
                       static_cast<double>(levels.size() * bitsOfSymbol(modulation)));
    return exactNoiseVariance(ebN0, rate) * ratio;
}

PamDemapping::PamDemapping(const ChannelSetup& setup, const Number& variance)
    : itsLevels(amplitudes(setup.modulation).begin(), amplitudes(setup.modulation).end()),
      itsBits(static_cast<std::size_t>(std::countr_zero(itsLevels.size()))),
      itsIsExact(setup.demapping == Demapping::exact && itsBits > 1),
      itsVariance(variance),
      itsScale(setup.quantiser.scale),
      itsStep(itsIsExact ? stepFor(variance.value()) : coarsestStep) {
    if (setup.quantiser.kind == Quantiser::Kind::amplitude) {
        itsScale = itsScale * variance * Number(0.5);
    }
    for (const std::int8_t level : itsLevels) {
        itsWeights.push_back(applied(mpfr_exp, Number(-0.5 * level * level) / variance));
    }
}

Number PamDemapping::soft(std::size_t bit, const Number& received) const {
    return itsIsExact ? exactSoft(bit, received) : maxLogSoft(bit, received);
}

/// All levels share the factor exp(-y^2 / (2 variance)); what is left of each is its weight times a power of
/// exp(y / variance).
Number PamDemapping::exactSoft(std::size_t bit, const Number& received) const {
    const Number base = applied(mpfr_exp, received / itsVariance);
    std::array<Number, 2> sums;
    for (std::size_t level = 0; level < itsLevels.size(); ++level) {
        Number power;
        mpfr_pow_si(power.get(), base.get(), itsLevels[level], MPFR_RNDN);
        Number& sum = sums[hasBit(level, bit) ? 1 : 0];
        sum = sum + power * itsWeights[level];
    }
    return itsScale * applied(mpfr_log, sums[1] / sums[0]);
}

Number PamDemapping::maxLogSoft(std::size_t bit, const Number& received) const {
    std::array<Number, 2> least = {Number(1e300), Number(1e300)};
    for (std::size_t level = 0; level < itsLevels.size(); ++level) {
        const Number distance = received - Number(itsLevels[level]);
        const Number square = distance * distance;
        Number& nearest = least[hasBit(level, bit) ? 1 : 0];
        if (square < nearest) {
            nearest = square;
        }
    }
    return itsScale * (least[0] - least[1]) / (itsVariance * Number(2));
}

}  // namespace quarzel::link
