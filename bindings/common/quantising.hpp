// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <span>

#include "outcome.hpp"

namespace quarzel::bindings {

/// Turn real numbers into soft values, as quarzel::quantise does.
/// @param soft  receives as many soft values
template <class Real>
Outcome quantise(std::span<const Real> values, double scale, std::span<std::int8_t> soft) noexcept {
    return guarded([&] {
        try {
            quarzel::quantise(values, soft, scale);
        } catch (const std::invalid_argument& error) {
            throw BindingError(Fault::value, error.what());
        }
    });
}

}  // namespace quarzel::bindings
