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
    /// After 2^blockShift counters the next block begins: its counter[1] is greater by 1, and counter[0] is
    /// the first one's again.
    unsigned blockShift = oneBlock;

    static constexpr unsigned oneBlock = 31;
};

/// Words that are drawn together: the 4 of each of 16 successive counters.
constexpr std::size_t countersPerGroup = 16;
constexpr std::size_t wordsPerGroup = 4 * countersPerGroup;

/// Channel outputs that are looked up together, from 16 words.
constexpr std::size_t valuesPerLookUp = 32;

/// Channel outputs that are searched for together.
constexpr std::size_t searchValues = 128;

/// The bits of a look-up cell, which stands for 16 neighbouring 16-bit random numbers.
constexpr int cellValueShift = 8;        ///< bits from here on: the output of the lowest of the 16
constexpr int cellNoThreshold = 31;      ///< the bits below: where the output rises by 1, or this
constexpr int cellLowMask = 31;          ///< mask of those bits
constexpr int cellManyThresholds = 32;   ///< set when the output rises at more than one place
constexpr std::size_t cellCount = 4096;  ///< cells of a table

/// A search among thresholds that vector registers have room for. Each level halves what is left; the place
/// of a search has bit i set when the random number is not below the threshold of level i, which stands at
/// the place so far. After the last level the output is that of the place before it, plus 1 when that level
/// set its bit.
struct SearchTable {
    static constexpr std::size_t mostLevels = 7;
    static constexpr std::size_t places = 64;  ///< before the last level

    std::size_t levels = 0;  ///< 6 or 7, or 0 where a search would leave too much undecided
    std::uint16_t thresholds[mostLevels][places];
    std::int16_t outputs[places];     ///< -127 to 127
    std::uint16_t undecided[places];  ///< what is not above it is undecided, unless the last level set its
                                      ///< bit: then this is the last threshold
};

struct DrawFunctions {
    /// Draw groups of words, of 16 counters each, from the input's counter on. Word 16 j + i of a group is
    /// word j of the output for the group's counter i.
    void (*drawWords)(const PhiloxInput& input, std::size_t groups, std::uint32_t* words);

    /// Look up `times` * 32 channel outputs. Of 16 words, the low halves decide the first 16, the high halves
    /// the rest. The code bit of an output is bit `lane` of its byte.
    /// @param undecided  receives 32 bits a time, that of the first output lowest: set when 16 random bits do
    ///                   not decide the output and it may be wrong
    void (*lookUp)(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                   const std::int32_t* cells, std::size_t times, std::int8_t* soft, std::uint32_t* undecided);

    /// Search for `count` channel outputs, decided by the same halves of words; null where a look-up is
    /// faster. Words are read, and `undecided` is written, for a multiple of searchValues outputs.
    /// @param undecided  as of a look-up, but set for some outputs that 16 random bits decide, too
    void (*search)(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                   const SearchTable& table, std::size_t count, std::int8_t* soft, std::uint32_t* undecided);
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
