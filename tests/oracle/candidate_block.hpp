// SPDX-License-Identifier: MIT
#pragma once

#include <random>
#include <string>

#include "oracle/plain_decoder.hpp"
#include "vectors/covering_blocks.hpp"

namespace quarzel::oracle {

/// The columns of a table of covering blocks, and a block's row.
inline constexpr const char* coveringColumns = "units,type,K,iterations,stimulus,ebn0,number,tag";
std::string rowOf(const tool::CoveringBlock& block, int units, int type);

/// A block at random: small ones mostly, and sizes where the number of segments or their windows change.
tool::CoveringBlock drawBlock(std::mt19937& random);

/// The soft values of a block.
Streams streamsOf(const tool::CoveringBlock& block, int units);

}  // namespace quarzel::oracle
