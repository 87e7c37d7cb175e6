// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>

namespace quarzel::link {

/// Refuse an array that is not of the size that fits.
/// @param what  the array holds, in the plural
/// @throws std::invalid_argument that names both sizes
inline void requireSize(const char* what, std::size_t size, std::size_t fitting) {
    if (size != fitting) {
        throw std::invalid_argument("there must be " + std::to_string(fitting) + " " + what + ", not " +
                                    std::to_string(size));
    }
}

/// Refuse a number that is not a multiple of another one.
/// @param what  is counted, in the plural
/// @throws std::invalid_argument that names the multiples next to it
inline void requireMultiple(const char* what, std::size_t number, std::size_t unit) {
    if (number % unit != 0) {
        const std::size_t below = number - number % unit;
        throw std::invalid_argument(std::string(what) + " must be a multiple of " + std::to_string(unit) +
                                    ", not " + std::to_string(number) + "; the nearest: " +
                                    std::to_string(below) + ", " + std::to_string(below + unit));
    }
}

}  // namespace quarzel::link
