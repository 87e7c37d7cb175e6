// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <vector>

#include "vectors/expected_decisions.hpp"
#include "vectors/memory_image.hpp"

namespace quarzel::tool {

/// Bits that are not as expected, by what there is instead.
struct DifferingBits {
    std::size_t wrong = 0;      ///< known and not as expected
    std::size_t undefined = 0;  ///< x
    std::size_t undriven = 0;   ///< z
    std::size_t missing = 0;    ///< not there

    std::size_t count() const { return wrong + undefined + undriven + missing; }

    /// Count a bit, if it is not as expected.
    /// @return whether it is not
    bool add(const MemoryWord& word, std::uint8_t expected);
};

/// A block that is not as expected.
struct BlockDifference {
    std::size_t block;     ///< from 0
    std::size_t firstBit;  ///< the first one that differs, from 0
    DifferingBits bits;
};

/// How the decisions of a simulation differ from those expected.
struct DecisionComparison {
    std::vector<BlockDifference> failing;  ///< in ascending order
    DifferingBits bits;                    ///< of all blocks
    std::array<std::size_t, 8> eighths{};  ///< bits that differ in each eighth of their block
    std::size_t beyond = 0;                ///< words after the last one expected

    bool isEqual() const { return failing.empty() && beyond == 0; }
};

/// Compare a memory that holds a decision a word.
DecisionComparison compareDecisions(const ExpectedDecisions& expected, const MemoryImage& actual);

}  // namespace quarzel::tool
