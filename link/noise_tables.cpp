// SPDX-License-Identifier: MIT
#include "link/noise_tables.hpp"

namespace quarzel::link {

Number exactNoiseVariance(Decibels ebN0, CodeRate rate) {
    // 10^(dB / 10) = 10^(micro / 10^7)
    Number variance;
    mpfr_set_si(variance.get(), -ebN0.micro, MPFR_RNDN);
    mpfr_div_ui(variance.get(), variance.get(), 10000000, MPFR_RNDN);
    mpfr_exp10(variance.get(), variance.get(), MPFR_RNDN);
    mpfr_mul_ui(variance.get(), variance.get(), rate.codedBits, MPFR_RNDN);
    mpfr_div_ui(variance.get(), variance.get(), rate.informationBits, MPFR_RNDN);
    mpfr_div_2ui(variance.get(), variance.get(), 1, MPFR_RNDN);
    return variance;
}

Number rootOfTwice(const Number& variance) {
    Number root;
    mpfr_mul_ui(root.get(), variance.get(), 2, MPFR_RNDN);
    mpfr_sqrt(root.get(), root.get(), MPFR_RNDN);
    return root;
}

std::uint64_t probabilityAbove(const Number& distance, const Number& deviationRoot2) {
    static constexpr double farAway = 7;
    // erfc(distance / (sigma 2^(1/2))) / 2
    Number x = distance / deviationRoot2;
    if (mpfr_cmp_d(x.get(), farAway) > 0) {
        // Here the function is 0 or 2 to far less than half a unit, and would take long to compute.
        return 0;
    }
    if (mpfr_cmp_d(x.get(), -farAway) < 0) {
        return std::uint64_t{1} << channelBits;
    }
    mpfr_erfc(x.get(), x.get(), MPFR_RNDN);
    mpfr_mul_2ui(x.get(), x.get(), channelBits - 1, MPFR_RNDN);
    return mpfr_get_uj(x.get(), MPFR_RNDN);
}

}  // namespace quarzel::link
