// SPDX-License-Identifier: MIT
#ifndef QUARZEL_QUANTISE_HPP
#define QUARZEL_QUANTISE_HPP

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <span>
#include <stdexcept>
#include <string>

#include "vardel_ip_quarzel.h"

/// Soft values of real numbers, over vardel_ip_quarzel.h. quarzel/core.hpp includes it.
namespace quarzel {

/// The scale for log-likelihood ratios.
inline constexpr double llrScale = VARDEL_IP_QUARZEL_LLR_SCALE;

/// What `quantise` does for both types.
template <class Real>
void quantiseWith(int (*function)(const Real*, std::size_t, double, std::int8_t*),
                  std::span<const Real> values, std::span<std::int8_t> soft, double scale) {
    if (soft.size() != values.size()) {
        throw std::invalid_argument("there must be room for " + std::to_string(values.size()) +
                                    " soft values, not " + std::to_string(soft.size()));
    }
    if (!(scale > 0 && std::isfinite(scale))) {
        throw std::invalid_argument("the scale must be above 0 and finite");
    }
    if (function(values.data(), values.size(), scale, soft.data()) != 0) {
        const auto wrong =
            std::count_if(values.begin(), values.end(), [](Real value) { return std::isnan(value); });
        throw std::invalid_argument(std::to_string(wrong) + " of " + std::to_string(values.size()) +
                                    " values are not a number (NaN); 0 says that a bit is unknown");
    }
}

/// Turn real numbers into soft values: round(scale * value), clipped to -128..127. A half goes to the even
/// number.
/// @param values  log-likelihood ratios ln(P(1)/P(0)), for which the default is the best scale, or samples
/// @param soft    receives as many soft values
/// @param scale   units of 1/8 for a value of 1
/// @throws std::invalid_argument, with nothing written, when `soft` has another size, the scale is not above
///         0 and finite, or a value is not a number (NaN)
/// Thread rule: any thread at any time.
inline void quantise(std::span<const double> values, std::span<std::int8_t> soft, double scale = llrScale) {
    quantiseWith(vardel_ip_quarzel_bitacc_quantise, values, soft, scale);
}

inline void quantise(std::span<const float> values, std::span<std::int8_t> soft, double scale = llrScale) {
    quantiseWith(vardel_ip_quarzel_bitacc_quantise_float, values, soft, scale);
}

}  // namespace quarzel

#endif
