// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <complex>
#include <span>
#include <string_view>

#include "link/modulation/modulation.hpp"

/// The inverse of modulation, on soft values.
namespace quarzel::link {

/// How a log-likelihood ratio is computed: from all symbols, or from the nearest one for each value of the
/// bit.
enum class Demapping { exact, maxLog };

/// Their names, in their order.
inline constexpr std::array<std::string_view, 2> demappingNames = {"exact", "maxlog"};

/// The method of a name.
/// @throws std::invalid_argument listing them when it is none of them
Demapping demappingOf(std::string_view name);

/// The log-likelihood ratios ln P(1) / P(0) of the bits of received symbols, which are equally likely and
/// have passed a channel that adds complex Gaussian noise.
/// @param noiseVariances  of a symbol, both components together: one for all, or one for each symbol, as the
///                        equaliser of a fading channel leaves them; above 0
/// @param ratios          receives Q_m for each symbol, in the order of its bits
/// @throws std::invalid_argument when a size does not fit or a variance is not above 0
void demodulate(std::span<const std::complex<double>> symbols, Modulation modulation,
                std::span<const double> noiseVariances, std::span<double> ratios,
                Demapping demapping = Demapping::maxLog);

}  // namespace quarzel::link
