// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

namespace quarzel::sweep {

/// An octet of blocks: numbers 8 n to 8 n + 7 of a point. Each byte that is encoded holds a bit of each.
constexpr std::uint64_t blocksPerOctet = 8;

/// Why a point has ended.
enum class StopReason { blockErrors, blocks, time };

/// As files spell it.
std::string_view nameOf(StopReason reason);
std::optional<StopReason> stopReasonOf(std::string_view name);

/// Blocks in error, in ascending order, with their bit errors after each iteration at which they are counted.
struct ErrorList {
    std::vector<std::uint64_t> blocks;     ///< numbers of the blocks
    std::vector<std::uint32_t> bitErrors;  ///< for each block one for each count; not all are 0

    std::size_t size() const { return blocks.size(); }
    const std::uint32_t* row(std::size_t i, std::size_t counts) const {
        return bitErrors.data() + i * counts;
    }
    void append(std::uint64_t block, const std::uint32_t* row, std::size_t counts) {
        blocks.push_back(block);
        bitErrors.insert(bitErrors.end(), row, row + counts);
    }
};

struct ErrorCount {
    std::uint64_t bitErrors = 0;
    std::uint64_t blockErrors = 0;

    bool operator==(const ErrorCount&) const = default;
};

/// How far a point has come, and the errors of its blocks so far.
struct PointState {
    std::uint64_t blocks = 0;        ///< done, without a gap; in a shard that divides them only its own
    std::vector<ErrorCount> counts;  ///< after each iteration, or after the last one only
    std::uint64_t bitErrorSquares =
        0;  ///< sum over the blocks of the squared bit errors after the last iteration
    std::optional<StopReason> stoppedBy;  ///< none: it has not ended
    double seconds = 0;                   ///< time spent on it

    explicit PointState(std::size_t countsPerBlock = 1) : counts(countsPerBlock) {}

    const ErrorCount& last() const { return counts.back(); }

    /// Count a block in error.
    /// @param row  its bit errors
    void add(const std::uint32_t* row);
};

}  // namespace quarzel::sweep
