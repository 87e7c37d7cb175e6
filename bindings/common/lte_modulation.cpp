// SPDX-License-Identifier: MIT
#include "lte_modulation.hpp"

#include "encoding.hpp"
#include "link/coding/require.hpp"

namespace quarzel::bindings {

std::size_t symbolsOf(link::Modulation modulation, std::size_t bits) {
    link::requireMultiple("bits", bits, link::bitsOfSymbol(modulation));
    return bits / link::bitsOfSymbol(modulation);
}

void modulate(link::Modulation modulation, std::span<const std::uint8_t> bits,
              std::span<std::complex<double>> symbols) {
    requireBits(bits);
    link::modulate(bits, modulation, symbols);
}

}  // namespace quarzel::bindings
