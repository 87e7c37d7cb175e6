// SPDX-License-Identifier: MIT
#pragma once

#include <cmath>
#include <complex>
#include <cstdint>
#include <random>
#include <vector>

/// 3GPP TS 36.211, section 7.1, as formulas, with nothing shared with what is tested.
namespace quarzel::test::standard {

using Symbol = std::complex<double>;

/// The symbol for Q_m bits. 3GPP TS 38.211, section 5.1, gives the same constellations by formula.
inline Symbol symbolOf(const std::vector<std::uint8_t>& b) {
    const auto sign = [&b](std::size_t i) { return 1.0 - 2.0 * b[i]; };
    switch (b.size()) {
        case 1:
            return Symbol(sign(0), sign(0)) / std::sqrt(2.0);
        case 2:
            return Symbol(sign(0), sign(1)) / std::sqrt(2.0);
        case 4:
            return Symbol(sign(0) * (2 - sign(2)), sign(1) * (2 - sign(3))) / std::sqrt(10.0);
        case 6:
            return Symbol(sign(0) * (4 - sign(2) * (2 - sign(4))), sign(1) * (4 - sign(3) * (2 - sign(5)))) /
                   std::sqrt(42.0);
        default:
            return Symbol(sign(0) * (8 - sign(2) * (4 - sign(4) * (2 - sign(6)))),
                          sign(1) * (8 - sign(3) * (4 - sign(5) * (2 - sign(7))))) /
                   std::sqrt(170.0);
    }
}

/// The bits of a number, the highest first.
inline std::vector<std::uint8_t> bitsOf(unsigned number, unsigned Qm) {
    std::vector<std::uint8_t> bits;
    for (unsigned i = Qm; i-- > 0;) {
        bits.push_back(number >> i & 1U);
    }
    return bits;
}

}  // namespace quarzel::test::standard
