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
/// @param decode  `decisions = decode(blocks)`: K bytes of 0 or 1 for each of the blocks, which have one
///                number of iterations
template <class Decode>
std::string frozenLine(const FrozenCase& which, Decode&& decode) {
    std::vector<Block> blocks;
    for (std::size_t kind = 0; kind < frozenClassNames.size(); ++kind) {
        blocks.push_back(frozenInput(which, static_cast<FrozenClass>(kind)));
    }
    std::array<std::string, frozenClassNames.size()> digests;
    for (const int iterations : frozenIterations) {
        for (Block& block : blocks) {
            block.iterations = iterations;
        }
        const std::vector<std::vector<unsigned char>> decisions = decode(blocks);
        for (std::size_t kind = 0; kind < digests.size(); ++kind) {
            digests[kind] += ',' + frozenDigest(decisions.at(kind));
        }
    }
    std::string line =
        std::to_string(which.K) + ',' + std::to_string(which.units) + ',' + std::to_string(which.algorithm);
    for (const std::string& text : digests) {
        line += text;
    }
    return line;
}

}  // namespace quarzel::test
