// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

/// The loops that draw random numbers, compiled for each instruction set. All give the same numbers.
namespace quarzel::link {

/// Counter and key of Philox4x32-10 (J. Salmon and others, "Parallel random numbers: as easy as 1, 2, 3",
/// SC11).
struct PhiloxInput {
    std::uint32_t counter[4];
    std::uint32_t key[2];
};

/// Words that are drawn together: those of 16 successive counters.
constexpr std::size_t wordsPerGroup = 64;

/// Channel outputs that are looked up together, from 16 words.
constexpr std::size_t valuesPerLookUp = 32;

/// The bits of a look-up cell, which stands for 16 neighbouring 16-bit random numbers.
constexpr int cellValueShift = 8;        ///< bits from here on: the output of the lowest of the 16
constexpr int cellNoThreshold = 31;      ///< the bits below: where the output rises by 1, or this
constexpr int cellLowMask = 31;          ///< mask of those bits
constexpr int cellManyThresholds = 32;   ///< set when the output rises at more than one place
constexpr std::size_t cellCount = 4096;  ///< cells of a table

struct DrawFunctions {
    /// Draw groups of words; input.counter[0] is that of the first word and goes on by 16 a group. Word 16 j
    /// + i of a group is word j of the output for the group's counter i.
    void (*drawWords)(const PhiloxInput& input, std::size_t groups, std::uint32_t* words);

    /// Look up `times` * 32 channel outputs. Of 16 words, the low halves decide the first 16, the high halves
    /// the rest. The code bit of an output is bit `lane` of its byte.
    /// @param isUndecided  receives for each output 0, or 1 when 16 random bits do not decide it and it may
    ///                     be wrong
    void (*lookUp)(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                   const std::int32_t* cells, std::size_t times, std::int8_t* soft,
                   std::uint8_t* isUndecided);
};

/// The fastest ones for this processor.
const DrawFunctions& drawFunctions();

/// Those that this processor can run, the fastest first.
struct DrawFunctionsList {
    const DrawFunctions* const* first;
    std::size_t size;
};
DrawFunctionsList supportedDrawFunctions();

}  // namespace quarzel::link
