// SPDX-License-Identifier: MIT
#pragma once

#include <complex>
#include <cstdint>
#include <span>

#include "link/modulation/modulation.hpp"

namespace quarzel::bindings {

/// The symbols that some bits make, for hosts that need the number beforehand.
/// @throws std::invalid_argument naming the nearest numbers of bits when they make no whole number of symbols
std::size_t symbolsOf(link::Modulation modulation, std::size_t bits);

/// Modulate bits from outside.
/// @throws BindingError when one is not 0 or 1
void modulate(link::Modulation modulation, std::span<const std::uint8_t> bits,
              std::span<std::complex<double>> symbols);

}  // namespace quarzel::bindings
