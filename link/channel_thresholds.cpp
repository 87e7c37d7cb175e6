// SPDX-License-Identifier: MIT
#include "link/channel_thresholds.hpp"

#include "link/noise_tables.hpp"

namespace quarzel::link {

double noiseVariance(Decibels ebN0, CodeRate rate) {
    const FreedCache freedCache;
    return exactNoiseVariance(ebN0, rate).value();
}

ChannelThresholds channelThresholds(const Quantiser& quantiser, Decibels ebN0, CodeRate rate) {
    const FreedCache freedCache;
    const Number variance = exactNoiseVariance(ebN0, rate);
    Number units(quantiser.scale);  // output units for an amplitude of 1
    if (quantiser.kind == Quantiser::Kind::llr) {
        mpfr_mul_ui(units.get(), units.get(), 2, MPFR_RNDN);
        mpfr_div(units.get(), units.get(), variance.get(), MPFR_RNDN);
    }
    const Number deviationRoot2 = rootOfTwice(variance);
    ChannelThresholds thresholds{};
    Number x;
    for (std::size_t i = 0; i < thresholds.size(); ++i) {
        // P(output < v) = P(1 + sigma n < (v - 1/2) / units)
        mpfr_set_d(x.get(), static_cast<double>(i) + lowestOutput + 0.5, MPFR_RNDN);
        mpfr_div(x.get(), x.get(), units.get(), MPFR_RNDN);
        mpfr_ui_sub(x.get(), 1, x.get(), MPFR_RNDN);
        thresholds[i] = probabilityAbove(x, deviationRoot2);
    }
    return thresholds;
}

}  // namespace quarzel::link
