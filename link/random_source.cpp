// SPDX-License-Identifier: MIT
#include "link/random_source.hpp"

#include <Random123/philox.h>

#include <algorithm>
#include <array>
#include <cstring>

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

/// For each byte the 8 bytes that hold its bits, the lowest first.
using SpreadTable = std::array<std::array<std::uint8_t, 8>, 256>;

constexpr SpreadTable makeSpreadTable() {
    SpreadTable table{};
    for (unsigned byte = 0; byte < table.size(); ++byte) {
        for (unsigned bit = 0; bit < 8; ++bit) {
            table[byte][bit] = byte >> bit & 1U;
        }
    }
    return table;
}

constexpr SpreadTable spreadTable = makeSpreadTable();

/// Set bit `lane` of each of `count` bytes, a multiple of 8, that is set in the words, lowest bit first.
void spreadBits(const std::uint32_t* words, unsigned lane, std::size_t count, std::uint8_t* bytes) {
    for (std::size_t at = 0; at < count; at += 8) {
        // Shifts and ors of 8 bytes together, none of which reaches into another.
        std::uint64_t eight = 0;
        std::uint64_t sum = 0;
        std::memcpy(&eight, spreadTable[words[at / 32] >> at % 32 & 0xffU].data(), 8);
        std::memcpy(&sum, bytes + at, 8);
        sum |= eight << lane;
        std::memcpy(bytes + at, &sum, 8);
    }
}

}  // namespace

RandomSource::RandomSource(const BlockName& name) : itsName(name), itsInput(inputOf(name)) {}

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
    drawFunctions().drawWords(input(purpose, firstGroup * static_cast<std::uint32_t>(wordsPerGroup / 4)),
                              groups, words);
}

void RandomSource::informationBits(unsigned lane, std::uint8_t* bits) const {
    constexpr std::uint32_t bitsPerGroup = 32 * wordsPerGroup;
    constexpr std::uint32_t fewBits = 4 * 32;
    std::array<std::uint32_t, wordsPerGroup> words;
    const std::uint32_t size = itsName.transportBlock != 0 ? itsName.transportBlock : itsName.blockSize;
    if (size <= fewBits) {
        // A group takes longer than the few numbers that are needed of it.
        PhiloxInput next = input(Purpose::informationBits, 0);
        for (std::uint32_t word = 0; 32 * word < size; ++word, ++next.counter[0]) {
            const auto& [a, b, c, d] = next.counter;
            words[word] =
                philox4x32((philox4x32_ctr_t{{a, b, c, d}}), (philox4x32_key_t{{next.key[0], next.key[1]}}))
                    .v[0];
        }
        spreadBits(words.data(), lane, size, bits);
        return;
    }
    for (std::uint32_t at = 0; at < size; at += bitsPerGroup) {
        this->words(Purpose::informationBits, at / bitsPerGroup, 1, words.data());
        const std::size_t count = std::min<std::size_t>(bitsPerGroup, size - at);
        spreadBits(words.data(), lane, count, bits + at);
    }
}

}  // namespace quarzel::link
