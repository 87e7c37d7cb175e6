// SPDX-License-Identifier: MIT
#include "link/modulation/modulation.hpp"

#include <algorithm>
#include <array>
#include <cmath>

#include "link/choice.hpp"
#include "link/coding/require.hpp"

namespace quarzel::link {

namespace {

// Tables 7.1.2-1 to 7.1.5-1, a component each: the bits of I are those with even numbers, of Q with odd ones.
constexpr std::array<std::int8_t, 2> amplitudes2 = {1, -1};
constexpr std::array<std::int8_t, 4> amplitudes4 = {1, 3, -1, -3};
constexpr std::array<std::int8_t, 8> amplitudes8 = {3, 1, 5, 7, -3, -1, -5, -7};
constexpr std::array<std::int8_t, 16> amplitudes16 = {5,  7,  3,  1,  11,  9,  13,  15,
                                                      -5, -7, -3, -1, -11, -9, -13, -15};

constexpr std::array<Modulation, 5> schemes = {Modulation::bpsk, Modulation::qpsk, Modulation::qam16,
                                               Modulation::qam64, Modulation::qam256};

}  // namespace

std::string_view nameOf(Modulation modulation) {
    const auto found = std::find(schemes.begin(), schemes.end(), modulation);
    return modulationNames.at(static_cast<std::size_t>(found - schemes.begin()));
}

Modulation modulationOf(std::string_view name) {
    return schemes.at(placeOf(modulationNames, name, "modulation"));
}

std::span<const std::int8_t> amplitudes(Modulation modulation) {
    switch (modulation) {
        case Modulation::qam16:
            return amplitudes4;
        case Modulation::qam64:
            return amplitudes8;
        case Modulation::qam256:
            return amplitudes16;
        default:
            return amplitudes2;
    }
}

double amplitudeUnit(Modulation modulation) {
    double energy = 0;
    const auto levels = amplitudes(modulation);
    for (const std::int8_t level : levels) {
        energy += 2.0 * level * level;
    }
    return 1 / std::sqrt(energy / static_cast<double>(levels.size()));
}

void modulate(std::span<const std::uint8_t> bits, Modulation modulation,
              std::span<std::complex<double>> symbols) {
    const std::size_t Qm = bitsOfSymbol(modulation);
    requireSize("bits", bits.size(), Qm * symbols.size());
    const auto levels = amplitudes(modulation);
    const double unit = amplitudeUnit(modulation);
    const std::uint8_t* bit = bits.data();
    for (std::complex<double>& symbol : symbols) {
        std::array<std::size_t, 2> numbers{};
        for (std::size_t i = 0; i < Qm; ++i) {
            numbers[i % 2] = 2 * numbers[i % 2] + *bit++;
        }
        numbers[1] = modulation == Modulation::bpsk ? numbers[0] : numbers[1];
        symbol = {unit * levels[numbers[0]], unit * levels[numbers[1]]};
    }
}

}  // namespace quarzel::link
