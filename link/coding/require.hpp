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

}  // namespace quarzel::link
