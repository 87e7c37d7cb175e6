// SPDX-License-Identifier: MIT
// Soft values of real numbers.
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>

#include "vardel_ip_quarzel.h"

namespace {

constexpr double lowest = std::numeric_limits<std::int8_t>::min();
constexpr double highest = std::numeric_limits<std::int8_t>::max();

/// The nearest whole number, of two the even one, whatever rounding the program has chosen.
int rounded(double value) {
    const int towardsZero = static_cast<int>(value);
    const double rest = value - towardsZero;
    const bool isOdd = towardsZero % 2 != 0;
    if (rest > 0.5 || (rest == 0.5 && isOdd)) {
        return towardsZero + 1;
    }
    return rest < -0.5 || (rest == -0.5 && isOdd) ? towardsZero - 1 : towardsZero;
}

template <class Real>
int quantise(const Real* values, std::size_t count, double scale, std::int8_t* soft) {
    if (!(scale > 0 && scale <= std::numeric_limits<double>::max()) ||
        std::any_of(values, values + count, [](Real value) { return std::isnan(value); })) {
        return 1;
    }
    std::transform(values, values + count, soft, [scale](Real value) {
        return static_cast<std::int8_t>(rounded(std::clamp(scale * double{value}, lowest, highest)));
    });
    return 0;
}

}  // namespace

int vardel_ip_quarzel_bitacc_quantise(const double* values, size_t count, double scale, int8_t* soft) {
    return quantise(values, count, scale, soft);
}

int vardel_ip_quarzel_bitacc_quantise_float(const float* values, size_t count, double scale, int8_t* soft) {
    return quantise(values, count, scale, soft);
}
