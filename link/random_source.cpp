// SPDX-License-Identifier: MIT
#include "link/random_source.hpp"

#include <algorithm>
#include <bit>

namespace quarzel::link {

namespace {

// The first word of the counter: index in bits 0 to 15, purpose in 16 to 18, K in 19 to 31, or for the code
// blocks of a transport block a number that is no K.
constexpr unsigned purposeShift = 16;
constexpr unsigned blockSizeShift = 19;
constexpr std::uint32_t firstCodeBlock = 7168;

// The third word: Eb/N0, whose bits 26 to 31 are alike, and the transmission over its bits 27 to 31.
constexpr unsigned transmissionShift = 27;

// The fourth word: the upper bits of the block's number, the repetition in 8 to 12, A in 13 to 31.
constexpr unsigned repetitionShift = 8;
constexpr unsigned transportBlockShift = 13;

PhiloxInput inputOf(const BlockName& name) {
    const std::uint32_t size = name.transportBlock != 0 ? firstCodeBlock + name.codeBlock : name.blockSize;
    return {{size << blockSizeShift, static_cast<std::uint32_t>(name.block),
             static_cast<std::uint32_t>(name.ebN0.micro) ^ name.transmission << transmissionShift,
             static_cast<std::uint32_t>(name.block >> 32) | name.repetition << repetitionShift |
                 name.transportBlock << transportBlockShift},
            {static_cast<std::uint32_t>(name.seed), static_cast<std::uint32_t>(name.seed >> 32)}};
}

/// Transpose the 8 by 8 bits that are in byte j of 8 words, for each j.
void transposeBytes(std::array<std::uint32_t, 8>& rows) {
    const auto swap = [&rows](unsigned distance, std::uint32_t mask) {
        for (unsigned row = 0; row < rows.size(); ++row) {
            if ((row & distance) == 0) {
                const std::uint32_t change = (rows[row] >> distance ^ rows[row + distance]) & mask;
                rows[row] ^= change << distance;
                rows[row + distance] ^= change;
            }
        }
    };
    swap(4, 0x0f0f0f0f);
    swap(2, 0x33333333);
    swap(1, 0x55555555);
}

}  // namespace

RandomSource::RandomSource(const BlockName& name) : itsName(name), itsInput(inputOf(name)) {}

OctetWords::OctetWords(const PhiloxInput& first, std::size_t count)
    : itsShift(static_cast<unsigned>(std::bit_width(std::min(count, countersPerGroup) - 1))) {
    PhiloxInput input = first;
    input.blockShift = itsShift;
    const std::size_t counters = blocksPerOctet << itsShift;
    drawFunctions().drawWords(input, (counters + countersPerGroup - 1) / countersPerGroup, itsWords.data());
}

RandomSource RandomSource::ofLane(unsigned lane) const {
    RandomSource source = *this;
    source.itsName.block = itsName.block - this->lane() + lane;
    source.itsInput.counter[1] = itsInput.counter[1] - this->lane() + lane;
    return source;
}

RandomSource RandomSource::ofTransmission() const {
    BlockName name = itsName;
    name.codeBlock = 0;
    return RandomSource(name);
}

PhiloxInput RandomSource::input(Purpose purpose, std::uint32_t index) const {
    PhiloxInput input = itsInput;
    input.counter[0] |= static_cast<std::uint32_t>(purpose) << purposeShift | index;
    return input;
}

void RandomSource::words(Purpose purpose, std::uint32_t firstGroup, std::size_t groups,
                         std::uint32_t* words) const {
    drawFunctions().drawWords(input(purpose, firstGroup * countersPerGroup), groups, words);
}

OctetWords RandomSource::octetWords(Purpose purpose, std::uint32_t firstGroup, std::size_t count) const {
    PhiloxInput first = input(purpose, firstGroup * countersPerGroup);
    first.counter[1] -= lane();
    return {first, count};
}

void RandomSource::octetBits(std::uint8_t* bits) const {
    constexpr std::size_t bitsPerGroup = 32 * wordsPerGroup;
    const std::size_t size = informationBitCount();
    for (std::size_t start = 0; start < size; start += bitsPerGroup) {
        const std::size_t count = std::min(bitsPerGroup, size - start);
        const OctetWords words = octetWords(
            Purpose::informationBits, static_cast<std::uint32_t>(start / bitsPerGroup), (count + 31) / 32);
        for (std::size_t at = 0; at < count; at += 32) {
            std::array<std::uint32_t, blocksPerOctet> rows;
            for (unsigned lane = 0; lane < blocksPerOctet; ++lane) {
                rows[lane] = words.of(lane)[at / 32];
            }
            transposeBytes(rows);
            for (std::size_t i = 0; i < std::min<std::size_t>(32, count - at); i += 8) {
                for (std::size_t row = 0; row < rows.size(); ++row) {
                    bits[start + at + i + row] = static_cast<std::uint8_t>(rows[row] >> i);
                }
            }
        }
    }
}

void RandomSource::informationBits(std::uint8_t* bits) const {
    octetBits(bits);
    for (std::size_t i = 0; i < informationBitCount(); ++i) {
        bits[i] = bits[i] >> lane() & 1U;
    }
}

}  // namespace quarzel::link
