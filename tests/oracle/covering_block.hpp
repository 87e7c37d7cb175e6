// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <map>
#include <random>
#include <string>

#include "oracle/plain_decoder.hpp"
#include "vectors/stimulus_source.hpp"

namespace quarzel::oracle {

/// A block that a set of vectors may have: its soft values are those of `quarzel vectors` with seed 1.
struct CoveringBlock {
    int K = 40;
    int iterations = 1;
    tool::Stimulus stimulus = tool::Stimulus::noise;
    int decibels = 0;  ///< Eb/N0 of the noise
    unsigned number = 0;
    unsigned tag = 0;
};

/// The columns of a table of blocks, and a block's row.
inline constexpr const char* coveringColumns = "units,type,K,iterations,stimulus,ebn0,number,tag";
std::string rowOf(const CoveringBlock& block, int units, int type);

/// A block at random: small ones mostly, and sizes where the number of segments or their windows change.
CoveringBlock drawBlock(std::mt19937& random);

/// Makes the soft values of blocks.
class CoveringSource {
  public:
    Streams make(const CoveringBlock& block, int units);

  private:
    std::map<int, tool::StimulusSource> itsSources;  ///< by Eb/N0
};

}  // namespace quarzel::oracle
