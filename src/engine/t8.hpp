// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

/// The eight state metrics of one trellis step, element i belonging to encoder state i; or, in elements 0 to
/// 3 alone, the four branch metrics of one step.
struct T8 {
    std::int16_t element[8];

    constexpr std::int16_t& operator[](std::size_t i) { return element[i]; }
    constexpr const std::int16_t& operator[](std::size_t i) const { return element[i]; }
};
static_assert(sizeof(T8) == 16);

/// Whether all eight elements are equal.
constexpr bool compareT8(const T8& x, const T8& y) {
    for (std::size_t i = 0; i < 8; ++i) {
        if (x[i] != y[i]) {
            return false;
        }
    }
    return true;
}

/// Whether elements 0 to 3 are equal: the comparison for branch-metric records.
constexpr bool compareT8_4(const T8& x, const T8& y) {
    for (std::size_t i = 0; i < 4; ++i) {
        if (x[i] != y[i]) {
            return false;
        }
    }
    return true;
}
