// SPDX-License-Identifier: MIT
// The drawing loops, compiled for each instruction set. Everything is in an unnamed namespace, so that the
// linker never lets an old processor run a function that was compiled for a new one.
#pragma once

#include <Random123/philox.h>

#include <cstring>

#include "link/draw/draw.hpp"

namespace quarzel::link {

namespace {

/// Products in 64 bits, whose upper halves may hold anything on the way: the form that vectorises best.
template <bool isOneBlock>
void drawGroups(const PhiloxInput& input, std::size_t groups, std::uint32_t* __restrict words) {
    constexpr std::uint32_t counters = countersPerGroup;
    constexpr std::uint64_t low = 0xffffffff;
    const std::uint32_t ofBlock = (std::uint32_t{1} << input.blockShift) - 1;
    for (std::size_t group = 0; group < groups; ++group, words += wordsPerGroup) {
        const std::uint32_t first = static_cast<std::uint32_t>(group) * counters;
        for (std::uint32_t i = 0; i < counters; ++i) {
            const std::uint32_t counter = first + i;
            std::uint64_t a = input.counter[0] + (isOneBlock ? counter : counter & ofBlock);
            std::uint64_t b = input.counter[1] + (isOneBlock ? 0 : counter >> input.blockShift);
            std::uint64_t c = input.counter[2];
            std::uint64_t d = input.counter[3];
            std::uint32_t key0 = input.key[0];
            std::uint32_t key1 = input.key[1];
            for (unsigned round = 0; round < philox4x32_rounds; ++round) {
                const std::uint64_t product0 = (a & low) * PHILOX_M4x32_0;
                const std::uint64_t product1 = (c & low) * PHILOX_M4x32_1;
                a = (product1 >> 32) ^ b ^ key0;
                b = product1;
                c = (product0 >> 32) ^ d ^ key1;
                d = product0;
                key0 += PHILOX_W32_0;
                key1 += PHILOX_W32_1;
            }
            words[i] = static_cast<std::uint32_t>(a);
            words[counters + i] = static_cast<std::uint32_t>(b);
            words[2 * counters + i] = static_cast<std::uint32_t>(c);
            words[3 * counters + i] = static_cast<std::uint32_t>(d);
        }
    }
}

inline void drawWords(const PhiloxInput& input, std::size_t groups, std::uint32_t* words) {
    const auto draw = input.blockShift == PhiloxInput::oneBlock ? drawGroups<true> : drawGroups<false>;
    draw(input, groups, words);
}

/// The output for one 16-bit random number and a code bit.
inline void lookUpOne(std::uint32_t random, std::uint32_t codeBit, const std::int32_t* cells,
                      std::int8_t& soft, std::uint8_t& isUndecided) {
    const std::int32_t cell = cells[random >> 4];
    const auto low = static_cast<std::int32_t>(random & 15U);
    const std::int32_t threshold = cell & cellLowMask;
    const std::int32_t one = (cell >> cellValueShift) + (low > threshold ? 1 : 0);
    const std::int32_t negate = static_cast<std::int32_t>(codeBit) - 1;
    const std::int32_t value = (one ^ negate) - negate;
    soft = static_cast<std::int8_t>(value < 127 ? value : 127);
    isUndecided = static_cast<std::uint8_t>((low == threshold) | ((cell & cellManyThresholds) != 0));
}

/// The bits of 32 bytes of 0 or 1, the first one lowest.
inline std::uint32_t bitsOf(const std::uint8_t* bytes) {
    constexpr std::uint64_t gather = 0x0102040810204080;  // moves the bit of byte i to bit 56 + i
    std::uint32_t bits = 0;
    for (unsigned at = 0; at < valuesPerLookUp; at += 8) {
        std::uint64_t eight = 0;
        std::memcpy(&eight, bytes + at, 8);
        bits |= static_cast<std::uint32_t>(eight * gather >> 56) << at;
    }
    return bits;
}

void lookUp(const std::uint32_t* __restrict words, const std::uint8_t* __restrict codeBits, unsigned lane,
            const std::int32_t* __restrict cells, std::size_t times, std::int8_t* __restrict soft,
            std::uint32_t* __restrict undecided) {
    constexpr std::size_t half = valuesPerLookUp / 2;
    std::uint8_t isUndecided[valuesPerLookUp];
    for (std::size_t time = 0; time < times; ++time) {
        for (std::size_t i = 0; i < half; ++i) {
            lookUpOne(words[i] & 0xffffU, codeBits[i] >> lane & 1U, cells, soft[i], isUndecided[i]);
        }
        for (std::size_t i = 0; i < half; ++i) {
            lookUpOne(words[i] >> 16, codeBits[half + i] >> lane & 1U, cells, soft[half + i],
                      isUndecided[half + i]);
        }
        undecided[time] = bitsOf(isUndecided);
        words += half;
        codeBits += valuesPerLookUp;
        soft += valuesPerLookUp;
    }
}

}  // namespace

}  // namespace quarzel::link
