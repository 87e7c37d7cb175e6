// SPDX-License-Identifier: MIT
#include "link/channel_thresholds.hpp"

#include <mpfr.h>

namespace quarzel::link {

namespace {

/// A number of 128 bits. Operations on it round correctly, to the nearest.
class Number {
  public:
    explicit Number(double value = 0) {
        mpfr_init2(itsValue, 128);
        mpfr_set_d(itsValue, value, MPFR_RNDN);
    }
    Number(const Number&) = delete;
    Number& operator=(const Number&) = delete;
    ~Number() { mpfr_clear(itsValue); }

    mpfr_ptr get() { return itsValue; }
    mpfr_srcptr get() const { return itsValue; }

  private:
    mpfr_t itsValue;
};

/// Frees the constants that the library keeps for a thread when the function ends: threads come and go.
class FreedCache {
  public:
    FreedCache() = default;
    FreedCache(const FreedCache&) = delete;
    FreedCache& operator=(const FreedCache&) = delete;
    ~FreedCache() { mpfr_free_cache(); }
};

/// 1 / (2 R 10^(dB / 10)) = 1.5 * 10^(-micro / 10^7).
void setNoiseVariance(Number& variance, Decibels ebN0) {
    mpfr_set_si(variance.get(), -ebN0.micro, MPFR_RNDN);
    mpfr_div_ui(variance.get(), variance.get(), 10000000, MPFR_RNDN);
    mpfr_exp10(variance.get(), variance.get(), MPFR_RNDN);
    mpfr_mul_d(variance.get(), variance.get(), 1.5, MPFR_RNDN);
}

}  // namespace

double noiseVariance(Decibels ebN0) {
    const FreedCache freedCache;
    Number variance;
    setNoiseVariance(variance, ebN0);
    return mpfr_get_d(variance.get(), MPFR_RNDN);
}

ChannelThresholds channelThresholds(const Quantiser& quantiser, Decibels ebN0) {
    const FreedCache freedCache;
    Number variance;
    setNoiseVariance(variance, ebN0);
    Number units(quantiser.scale);  // output units for an amplitude of 1
    if (quantiser.kind == Quantiser::Kind::llr) {
        mpfr_mul_ui(units.get(), units.get(), 2, MPFR_RNDN);
        mpfr_div(units.get(), units.get(), variance.get(), MPFR_RNDN);
    }
    Number deviationRoot2;  // sigma times the square root of 2
    mpfr_mul_ui(deviationRoot2.get(), variance.get(), 2, MPFR_RNDN);
    mpfr_sqrt(deviationRoot2.get(), deviationRoot2.get(), MPFR_RNDN);

    ChannelThresholds thresholds{};
    Number x;
    const Number farAway(7);
    for (std::size_t i = 0; i < thresholds.size(); ++i) {
        // P(output < v) = P(1 + sigma n < (v - 1/2) / units) = erfc((1 - (v - 1/2) / units) / (sigma
        // 2^(1/2))) / 2
        mpfr_set_d(x.get(), static_cast<double>(i) + lowestOutput + 0.5, MPFR_RNDN);
        mpfr_div(x.get(), x.get(), units.get(), MPFR_RNDN);
        mpfr_ui_sub(x.get(), 1, x.get(), MPFR_RNDN);
        mpfr_div(x.get(), x.get(), deviationRoot2.get(), MPFR_RNDN);
        if (mpfr_cmpabs(x.get(), farAway.get()) > 0) {
            // Here the function is 0 or 2 to far less than half a unit, and would take long to compute.
            thresholds[i] = mpfr_sgn(x.get()) > 0 ? 0 : std::uint64_t{1} << channelBits;
            continue;
        }
        mpfr_erfc(x.get(), x.get(), MPFR_RNDN);
        mpfr_mul_2ui(x.get(), x.get(), channelBits - 1, MPFR_RNDN);
        thresholds[i] = mpfr_get_uj(x.get(), MPFR_RNDN);
    }
    return thresholds;
}

}  // namespace quarzel::link
