// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

/// The loops that draw random numbers, once for each instruction set. All give the same numbers.
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
constexpr int cellValueShift = 8;        ///< above: the output of the lowest of the 16
constexpr int cellNoThreshold = 31;      ///< lower bits: where the output rises by 1, or this
constexpr int cellLowMask = 31;          ///< mask of those bits
constexpr int cellManyThresholds = 32;   ///< set when one place does not tell
constexpr std::size_t cellCount = 4096;  ///< cells of a table

/// What stands for an output that 16 random bits do not decide.
constexpr int undecided = 1 << 20;

struct DrawFunctions {
    /// Draw groups of words; input.counter[0] is that of the first word and goes on by 16 a group. Word 16 j
    /// + i of a group is word j of the output for the group's counter i.
    void (*drawWords)(const PhiloxInput& input, std::size_t groups, std::uint32_t* words);

    /// Look up `times` * 32 channel outputs. Of 16 words, the low halves decide the first 16, the high halves
    /// the rest. The code bit of an output is bit `lane` of its byte.
    /// @param isUndecided  receives for each output 1 when it is `undecided`, else 0
    void (*lookUp)(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                   const std::int32_t* cells, std::size_t times, int* soft, std::uint8_t* isUndecided);
};

/// The fastest for this processor.
const DrawFunctions& drawFunctions();

/// Those that this processor can run, the fastest first.
struct DrawFunctionsList {
    const DrawFunctions* const* first;
    std::size_t size;
};
DrawFunctionsList supportedDrawFunctions();

}  // namespace quarzel::link
