// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "link/random_source.hpp"

namespace quarzel::sweep {

using link::blocksPerOctet;

/// Why a point has ended.
enum class StopReason { blockErrors, blocks, time };

/// As files spell it.
std::string_view nameOf(StopReason reason);
std::optional<StopReason> stopReasonOf(std::string_view name);

/// What is counted of a block: its wrong bits, and marks for what they do not tell of a block with CRCs.
constexpr std::uint32_t undetectedMark = 1U << 31U;  ///< its bits are wrong, its CRCs hold
constexpr std::uint32_t rejectedMark = 1U << 30U;    ///< its bits are right, its CRCs do not hold

/// Blocks in error, in ascending order, with a row for each: what is counted of it each time and, where the
/// receiver has a stop rule, the iterations that it used in each transmission, 0 where there was none.
struct ErrorList {
    std::vector<std::uint64_t> blocks;     ///< numbers of the blocks
    std::vector<std::uint32_t> bitErrors;  ///< the rows; not all of a row are 0

    std::size_t size() const { return blocks.size(); }
    const std::uint32_t* row(std::size_t i, std::size_t columns) const {
        return bitErrors.data() + i * columns;
    }
    void append(std::uint64_t block, const std::uint32_t* row, std::size_t columns) {
        blocks.push_back(block);
        bitErrors.insert(bitErrors.end(), row, row + columns);
    }
};

struct ErrorCount {
    std::uint64_t bitErrors = 0;
    std::uint64_t blockErrors = 0;
    std::uint64_t undetected = 0;  ///< of them: those whose CRCs hold

    bool operator==(const ErrorCount&) const = default;
};

/// How far a point has come, and the errors of its blocks so far.
struct PointState {
    std::uint64_t blocks = 0;  ///< done, without a gap; in a shard that divides them only its own
    /// After each transmission or, where there is one, after each iteration or the last one only.
    std::vector<ErrorCount> counts;
    /// Entry i: how many times a receiver with a stop rule used i + 1 iterations; empty without.
    std::vector<std::uint64_t> iterationsUsed;
    std::uint64_t bitErrorSquares = 0;    ///< sum over the blocks of the squared bit errors at the last count
    std::optional<StopReason> stoppedBy;  ///< none: it has not ended
    double seconds = 0;                   ///< time spent on it

    /// @param mostIterations  of a receiver with a stop rule; 0 without
    explicit PointState(std::size_t countsPerBlock = 1, std::size_t mostIterations = 0)
        : counts(countsPerBlock), iterationsUsed(mostIterations) {}

    /// With nothing counted yet.
    PointState emptied() const { return PointState(counts.size(), iterationsUsed.size()); }

    /// The entries of a row.
    std::size_t columns() const { return counts.size() * (iterationsUsed.empty() ? 1 : 2); }

    const ErrorCount& last() const { return counts.back(); }

    /// Count a block in error.
    /// @param row  of columns() entries
    void add(const std::uint32_t* row);
};

}  // namespace quarzel::sweep
