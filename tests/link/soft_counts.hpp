// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <vector>

/// How often soft values come, and whether two ways give them equally often.
namespace quarzel::test {

using Counts = std::array<double, 256>;  ///< of the soft values -128 to 127

inline std::size_t placeOf(int soft) {
    return static_cast<std::size_t>(soft + 128);
}

/// What the counts are held against: counts of a second draw, or the mean of what is drawn.
enum class Against { draw, mean };

/// How far counts are from what they are held against: chi-square, normalised to a mean of 0 and a deviation
/// of 1 (Wilson and Hilferty). Neighbouring values are taken together until they are expected 20 times, or 40
/// times in two draws.
inline double deviation(const Counts& observed, const Counts& expected, Against against) {
    struct Cell {
        double observed = 0;
        double expected = 0;
        [[nodiscard]] double variance(Against a) const {
            return expected + (a == Against::draw ? observed : 0);
        }
    };
    const double least = against == Against::draw ? 40 : 20;
    std::vector<Cell> cells(1);
    for (std::size_t i = 0; i < observed.size(); ++i) {
        if (cells.back().variance(against) >= least) {
            cells.emplace_back();
        }
        cells.back().observed += observed[i];
        cells.back().expected += expected[i];
    }
    if (cells.size() > 1 && cells.back().variance(against) < least) {
        const Cell rest = cells.back();
        cells.pop_back();
        cells.back().observed += rest.observed;
        cells.back().expected += rest.expected;
    }
    double chiSquare = 0;
    for (const Cell& cell : cells) {
        const double difference = cell.observed - cell.expected;
        chiSquare += difference * difference / cell.variance(against);
    }
    const double freedom = std::max(static_cast<double>(cells.size()) - 1, 1.0);
    const double spread = 2 / (9 * freedom);
    return (std::cbrt(chiSquare / freedom) - (1 - spread)) / std::sqrt(spread);
}

}  // namespace quarzel::test
