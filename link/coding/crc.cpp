// SPDX-License-Identifier: MIT
#include "link/coding/crc.hpp"

#include <array>
#include <cstddef>

#include "link/coding/require.hpp"

namespace quarzel::link {

namespace {

/// A generator polynomial without its highest power, and what each byte leaves. Remainders are aligned to the
/// left of 32 bits, so that one loop serves all lengths.
struct Generator {
    unsigned length;
    std::uint32_t polynomial;
    std::array<std::uint32_t, 256> remainders{};

    constexpr Generator(unsigned powers, std::uint32_t lowerPowers)
        : length(powers), polynomial(lowerPowers << (32 - powers)) {
        for (std::uint32_t byte = 0; byte < remainders.size(); ++byte) {
            std::uint32_t remainder = byte << 24;
            for (int bit = 0; bit < 8; ++bit) {
                remainder = shifted(remainder);
            }
            remainders[byte] = remainder;
        }
    }

    constexpr std::uint32_t shifted(std::uint32_t remainder) const {
        return remainder << 1 ^ (remainder >> 31 != 0 ? polynomial : 0);
    }
};

/// In the order of Crc.
constexpr std::array<Generator, 4> generators = {{{24, 0x864cfb}, {24, 0x800063}, {16, 0x1021}, {8, 0x9b}}};

const Generator& generatorOf(Crc crc) {
    return generators[static_cast<std::size_t>(crc)];
}

/// Eight bits as a byte, the first one highest: the product moves bit i of 0 or 1 from byte i to 63 - i.
std::uint32_t byteOf(const std::uint8_t* bits) {
    std::uint64_t word = 0;
    for (unsigned i = 0; i < 8; ++i) {
        word |= std::uint64_t{bits[i]} << 8 * i;
    }
    return static_cast<std::uint32_t>(word * 0x8040201008040201U >> 56);
}

}  // namespace

unsigned crcLength(Crc crc) {
    return generatorOf(crc).length;
}

std::uint32_t crcOf(Crc crc, std::span<const std::uint8_t> bits) {
    const Generator& generator = generatorOf(crc);
    std::uint32_t remainder = 0;
    std::size_t i = 0;
    for (; i < bits.size() % 8; ++i) {
        remainder = generator.shifted(remainder ^ std::uint32_t{bits[i]} << 31);
    }
    for (; i < bits.size(); i += 8) {
        remainder = remainder << 8 ^ generator.remainders[remainder >> 24 ^ byteOf(&bits[i])];
    }
    return remainder >> (32 - generator.length);
}

void writeCrc(Crc crc, std::span<const std::uint8_t> bits, std::span<std::uint8_t> parity) {
    requireSize("parity bits", parity.size(), crcLength(crc));
    const std::uint32_t remainder = crcOf(crc, bits);
    for (std::size_t i = 0; i < parity.size(); ++i) {
        parity[i] = remainder >> (parity.size() - 1 - i) & 1U;
    }
}

bool crcHolds(Crc crc, std::span<const std::uint8_t> bits) {
    return crcOf(crc, bits) == 0;
}

}  // namespace quarzel::link
