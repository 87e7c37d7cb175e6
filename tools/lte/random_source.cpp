// SPDX-License-Identifier: MIT
#include "random_source.hpp"

#include <Random123/philox.h>

#include <algorithm>
#include <array>

namespace quarzel::lte {

namespace {

// The first word of the counter: index in bits 0 to 15, purpose in 16 to 18, K in 19 to 31.
constexpr unsigned purposeShift = 16;
constexpr unsigned blockSizeShift = 19;

}  // namespace

RandomSource::RandomSource(const BlockName& name)
    : itsInput{{name.blockSize << blockSizeShift, static_cast<std::uint32_t>(name.block),
                static_cast<std::uint32_t>(name.ebN0.micro), static_cast<std::uint32_t>(name.block >> 32)},
               {static_cast<std::uint32_t>(name.seed), static_cast<std::uint32_t>(name.seed >> 32)}},
      itsBlockSize(name.blockSize) {}

PhiloxInput RandomSource::input(Purpose purpose, std::uint32_t index) const {
    PhiloxInput input = itsInput;
    input.counter[0] |= static_cast<std::uint32_t>(purpose) << purposeShift | index;
    return input;
}

void RandomSource::words(Purpose purpose, std::uint32_t firstGroup, std::size_t groups,
                         std::uint32_t* words) const {
    drawFunctions().drawWords(input(purpose, firstGroup * (wordsPerGroup / 4)), groups, words);
}

std::uint32_t RandomSource::word(Purpose purpose, std::uint32_t index) const {
    const PhiloxInput in = input(purpose, index);
    const philox4x32_ctr_t counter = {{in.counter[0], in.counter[1], in.counter[2], in.counter[3]}};
    return philox4x32(counter, (philox4x32_key_t{{in.key[0], in.key[1]}})).v[0];
}

void RandomSource::informationBits(unsigned lane, std::uint8_t* bits) const {
    constexpr std::size_t bitsPerGroup = 32 * wordsPerGroup;
    std::array<std::uint32_t, wordsPerGroup> words;
    for (std::uint32_t at = 0; at < itsBlockSize; at += bitsPerGroup) {
        this->words(Purpose::informationBits, at / bitsPerGroup, 1, words.data());
        const std::size_t count = std::min<std::size_t>(bitsPerGroup, itsBlockSize - at);
        drawFunctions().spreadBits(words.data(), lane, count, bits + at);
    }
}

}  // namespace quarzel::lte
