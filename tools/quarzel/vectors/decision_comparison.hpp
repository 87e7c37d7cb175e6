// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>

#include "vectors/expected_decisions.hpp"
#include "vectors/memory_image.hpp"

namespace quarzel::tool {

/// Where decisions first differ from those expected.
struct FirstDifference {
    std::size_t block;  ///< from 0
    std::size_t bit;    ///< of the block, from 0
};

/// How the decisions of a simulation differ from those expected.
struct DecisionComparison {
    std::optional<FirstDifference> first;
    std::size_t blocks = 0;     ///< blocks with a difference
    std::size_t wrong = 0;      ///< bits that are known and not as expected
    std::size_t undefined = 0;  ///< bits that are x
    std::size_t undriven = 0;   ///< bits that are z
    std::size_t missing = 0;    ///< bits that are not there
    std::size_t beyond = 0;     ///< words after the last one expected

    /// Bits that are not as expected.
    std::size_t bits() const { return wrong + undefined + undriven + missing; }
    bool isEqual() const { return bits() == 0 && beyond == 0; }
};

/// Compare a memory that holds a decision a word.
DecisionComparison compareDecisions(const ExpectedDecisions& expected, const MemoryImage& actual);

}  // namespace quarzel::tool
