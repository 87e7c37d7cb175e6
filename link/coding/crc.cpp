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

/// Eight bits of 8 blocks as a byte for each block, that of block i from bit 8 i on, the first bit highest: a
/// matrix of 8 by 8 bits transposed.
std::uint64_t bytesOf(const std::uint8_t* bits) {
    std::uint64_t word = 0;
    for (unsigned i = 0; i < 8; ++i) {
        word |= std::uint64_t{bits[i]} << 8 * (7 - i);
    }
    const auto swap = [&word](unsigned distance, std::uint64_t mask) {
        const std::uint64_t change = (word ^ word >> distance) & mask;
        word ^= change ^ change << distance;
    };
    swap(7, 0x00aa00aa00aa00aa);
    swap(14, 0x0000cccc0000cccc);
    swap(28, 0x00000000f0f0f0f0);
    return word;
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
    const Generator& generator = generatorOf(crc);
    std::array<std::uint32_t, 8> remainders{};
    std::size_t i = 0;
    for (; i < bits.size() % 8; ++i) {
        for (unsigned block = 0; block < remainders.size(); ++block) {
            remainders[block] =
                generator.shifted(remainders[block] ^ (std::uint32_t{bits[i]} >> block & 1U) << 31);
        }
    }
    for (; i < bits.size(); i += 8) {
        const std::uint64_t bytes = bytesOf(&bits[i]);
        for (unsigned block = 0; block < remainders.size(); ++block) {
            remainders[block] = remainders[block] << 8 ^
                                generator.remainders[remainders[block] >> 24 ^ (bytes >> 8 * block & 0xffU)];
        }
    }
    for (std::size_t power = 0; power < parity.size(); ++power) {
        std::uint32_t together = 0;
        for (unsigned block = 0; block < remainders.size(); ++block) {
            together |= (remainders[block] >> (31 - power) & 1U) << block;
        }
        parity[power] = static_cast<std::uint8_t>(together);
    }
}

bool crcHolds(Crc crc, std::span<const std::uint8_t> bits) {
    return crcOf(crc, bits) == 0;
}

}  // namespace quarzel::link
