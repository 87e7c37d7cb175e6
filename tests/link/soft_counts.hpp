// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>

/// How often soft values come, and whether two ways give them equally often.
namespace quarzel::test {

using Counts = std::array<double, 256>;  ///< of the soft values -128 to 127

inline std::size_t placeOf(int soft) {
    return static_cast<std::size_t>(soft + 128);
}

/// How far two sets of counts, or counts and expectations, are apart: chi-square, normalised to a mean of 0
/// and a deviation of 1 (Wilson and Hilferty). Values that are expected less than 20 times are taken
/// together.
inline double deviation(const Counts& observed, const Counts& expected, double varianceOfDifference) {
    double chiSquare = 0;
    double cells = 0;
    double restObserved = 0;
    double restExpected = 0;
    const auto add = [&](double o, double e) {
        chiSquare += (o - e) * (o - e) / (e * varianceOfDifference);
        cells += 1;
    };
    for (std::size_t i = 0; i < observed.size(); ++i) {
        restObserved += observed[i];
        restExpected += expected[i];
        if (restExpected >= 20) {
            add(restObserved, restExpected);
            restObserved = restExpected = 0;
        }
    }
    if (restExpected >= 1) {
        add(restObserved, restExpected);
    }
    const double freedom = std::max(cells - 1, 1.0);
    const double spread = 2 / (9 * freedom);
    return (std::cbrt(chiSquare / freedom) - (1 - spread)) / std::sqrt(spread);
}

}  // namespace quarzel::test
