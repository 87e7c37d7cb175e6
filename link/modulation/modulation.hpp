// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <complex>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

/// Modulation of 3GPP TS 36.211, section 7.1. Bits are bytes of 0 or 1. All functions are pure, but for what
/// they write.
namespace quarzel::link {

/// The schemes; the number of each is Q_m, its bits of a symbol.
enum class Modulation : unsigned { bpsk = 1, qpsk = 2, qam16 = 4, qam64 = 6, qam256 = 8 };

/// Q_m.
constexpr unsigned bitsOfSymbol(Modulation modulation) {
    return static_cast<unsigned>(modulation);
}

/// Their names, the one with fewest bits first.
inline constexpr std::array<std::string_view, 5> modulationNames = {"bpsk", "qpsk", "16qam", "64qam",
                                                                    "256qam"};
std::string_view nameOf(Modulation modulation);

/// The scheme of a name.
/// @throws std::invalid_argument listing them when it is none of them
Modulation modulationOf(std::string_view name);

/// The amplitudes that a component of a symbol, I or Q, may have, in units of `amplitudeUnit`: entry i for
/// the bits of i that decide it, the first one highest. BPSK has one component, on the diagonal.
std::span<const std::int8_t> amplitudes(Modulation modulation);

/// The unit of amplitudes; the mean energy of a symbol is 1.
double amplitudeUnit(Modulation modulation);

/// @param bits     those of whole symbols
/// @param symbols  receives one for each Q_m bits
/// @throws std::invalid_argument when a size does not fit
void modulate(std::span<const std::uint8_t> bits, Modulation modulation,
              std::span<std::complex<double>> symbols);

}  // namespace quarzel::link
