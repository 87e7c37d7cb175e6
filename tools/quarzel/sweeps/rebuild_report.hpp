// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <ostream>
#include <string>

#include "captures/bits_file.hpp"
#include "sweep/setup.hpp"

namespace quarzel::tool {

/// What `quarzel rebuild` tells.
struct RebuildReport {
    std::string result;
    std::uint64_t seed;
    std::size_t point;  ///< in the result, from 0
    sweep::Setup setup;
    std::uint64_t number;    ///< of the block, from 0
    std::size_t codeBlock;   ///< from 0
    std::size_t codeBlocks;  ///< of the block
    std::uint32_t blockSize;
    BitErrors errors;
};

void printText(std::ostream& stream, const RebuildReport& report);

/// One JSON object on a line of its own.
void printJson(std::ostream& stream, const RebuildReport& report);

}  // namespace quarzel::tool
