// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

namespace quarzel::tool {

/// How a core cuts a block.
struct CoreLayout {
    std::uint32_t units;    ///< processing units of the core
    std::uint32_t threads;  ///< its threads
    std::uint32_t segments;
    std::uint32_t steps;                 ///< trellis steps of each segment
    std::vector<std::uint32_t> windows;  ///< their lengths, in the order of the segment
};

/// @param K  a valid block size
CoreLayout coreLayout(std::uint32_t K, std::uint32_t units);

}  // namespace quarzel::tool
