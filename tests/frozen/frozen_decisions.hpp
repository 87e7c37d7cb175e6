// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "frozen/frozen_input.hpp"

namespace quarzel::test {

inline constexpr std::array<int, 5> frozenIterations = {1, 2, 5, 8, 15};

/// All cases in the order of the file: by block size, units and algorithm.
std::vector<FrozenCase> frozenCases();

/// The first line of the file, without its line end.
std::string frozenHeader();

/// The digest of the decisions of a block: the first 16 digits of their SHA-256.
std::string frozenDigest(const std::vector<unsigned char>& decisions);

/// A line of the file: the case and the digests of its decisions.
/// @param decode  `decisions = decode(blocks)`: K bytes of 0 or 1 for each of the blocks
template <class Decode>
std::string frozenLine(const FrozenCase& which, Decode&& decode) {
    std::vector<Block> inputs;
    for (std::size_t kind = 0; kind < frozenClassNames.size(); ++kind) {
        inputs.push_back(frozenInput(which, static_cast<FrozenClass>(kind)));
    }
    std::vector<Block> blocks;
    for (const int iterations : frozenIterations) {
        for (Block& block : inputs) {
            block.iterations = iterations;
            blocks.push_back(block);
        }
    }
    const std::vector<std::vector<unsigned char>> decisions = decode(blocks);
    std::string line =
        std::to_string(which.K) + ',' + std::to_string(which.units) + ',' + std::to_string(which.algorithm);
    for (std::size_t kind = 0; kind < inputs.size(); ++kind) {
        for (std::size_t block = kind; block < blocks.size(); block += inputs.size()) {
            line += ',' + frozenDigest(decisions.at(block));
        }
    }
    return line;
}

}  // namespace quarzel::test
