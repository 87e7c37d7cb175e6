// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>
#include <vector>

/// How a code block is divided among the threads of parallel processing units: pure functions of the block
/// size and the number of threads.
namespace quarzel {

/// A range of trellis steps over which one recursion runs.
struct ABSegment {
    std::uint32_t from;  ///< the step where the recursion starts
    std::uint32_t to;    ///< where it ends. Forward: the first step of the next segment. Backward: the step
                         ///< just below the window, or 0 for the window that starts at step 0
};

/// "[" from "," to ")".
std::string toText(const ABSegment& segment);
std::ostream& operator<<(std::ostream& stream, const ABSegment& segment);

/// Thread segments that a block is cut into: doubled while there are threads left and each segment keeps 64
/// steps. The doubling may exceed a thread count that is not a power of two.
constexpr std::uint32_t threadSegments(std::uint32_t K, std::uint32_t threads) {
    std::uint32_t count = 1;
    while (count < threads && std::uint64_t{128} * count <= K) {
        count *= 2;
    }
    return count;
}

/// The length of the next backward window when `rest` steps of a thread segment are left: at most 64, and a
/// rest of 65 to 127 in two nearly equal parts.
constexpr std::uint32_t windowLength(std::uint32_t rest) {
    if (rest > 127) {
        return 64;
    }
    return rest > 64 ? (rest + 1) / 2 : rest;
}

/// Backward windows of a thread segment of so many steps, from the lowest up.
std::vector<std::uint16_t> windowLengths(std::uint32_t steps);

/// The segments and windows of a block of K steps cut into `count` thread segments; K is a multiple of count.
///
/// @param alpha  receives the thread segments
/// @param beta   receives the windows, window-major: the first ones of all thread segments, then the second
/// ...
void cutSegments(std::uint32_t K, std::uint32_t count, std::vector<ABSegment>& alpha,
                 std::vector<ABSegment>& beta);

}  // namespace quarzel
