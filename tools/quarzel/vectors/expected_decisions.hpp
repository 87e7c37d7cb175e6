// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <istream>
#include <string>
#include <vector>

namespace quarzel::tool {

/// A block whose decisions are expected.
struct ExpectedBlock {
    std::uint32_t blockSize;   ///< K
    std::size_t firstBit;      ///< where its decisions begin
    int iterations;            ///< 0: not known
    std::string stimulus;      ///< what its soft values are; may be empty
    std::string traceCommand;  ///< prints the model's trace of it; may be empty

    /// What is known of it beyond K: "6 iterations, noise", or nothing.
    std::string about() const;
};

/// What a simulation is to give.
struct ExpectedDecisions {
    std::string name;  ///< for people
    std::vector<ExpectedBlock> blocks;
    std::vector<std::uint8_t> bits;  ///< 0 or 1, block after block

    /// K / 8 when every block has the same K, else 0.
    std::size_t packedSize() const;
};

/// Read the decisions that an npy file of packed bits holds.
/// @param file  its name, for error messages
/// @throws ToolError when it is not well-formed or has another type or shape
ExpectedDecisions readPacked(std::istream& stream, const std::string& file);

/// Read the decisions of a core of a vector set, named by its directory, its memory of decisions or, where
/// the set has only one core, the directory of the set; or an npy file of packed bits.
/// @throws ToolError when that fails, or a file of the set is not as it was made
ExpectedDecisions readExpected(const std::string& name);

}  // namespace quarzel::tool
