// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <istream>
#include <string>
#include <vector>

#include "captures/npy_header.hpp"

namespace quarzel::tool {

/// The information bits of code blocks, 8 to a byte, the first bit highest: the order of numpy.packbits.
struct PackedBits {
    std::size_t bytesPerBlock;        ///< K / 8; every valid K is a multiple of 8
    std::vector<std::uint8_t> bytes;  ///< block after block

    /// Room for blocks of K bits, all 0.
    PackedBits(std::size_t blocks, std::size_t K) : bytesPerBlock(K / 8), bytes(blocks * bytesPerBlock) {}

    std::size_t blocks() const { return bytes.size() / bytesPerBlock; }

    /// Pack 8 bits, each a byte of 0 or 1, into a byte.
    /// @param block  the block whose place receives them; blocks may be set from several threads
    /// @param bits   8 * bytesPerBlock of them
    void set(std::size_t block, const unsigned char* bits);
};

/// Read an npy file of uint8 values of shape (blocks, bytesPerBlock).
/// @param file  the name for error messages
/// @throws ToolError when it is not well-formed or has another type or shape
PackedBits readBits(std::istream& stream, const std::string& file, std::size_t blocks,
                    std::size_t bytesPerBlock);

/// The same, whose header was read. Memory grows with what the file holds, not with what its header claims.
PackedBits readBitsAfter(const NpyHeader& header, std::istream& stream, const std::string& file,
                         std::size_t blocks, std::size_t bytesPerBlock);

/// The bytes of an npy file of uint8 values of shape (blocks, bytesPerBlock).
std::string npyOf(const PackedBits& bits);

/// Write an npy file of uint8 values of shape (blocks, bytesPerBlock), whole or not at all.
/// @throws ToolError when that fails
void writeBits(const std::string& file, const PackedBits& bits);

/// A block that differs from another one.
struct WrongBlock {
    std::size_t block;     ///< from 0
    std::size_t bits;      ///< that differ
    std::size_t firstBit;  ///< the first of them, from 0
};

/// How two sets of blocks differ.
struct BitErrors {
    std::size_t bits = 0;            ///< bits that differ
    std::vector<WrongBlock> blocks;  ///< those with a bit that differs, in ascending order
};

/// Find the differences of two sets of the same shape.
BitErrors findErrors(const PackedBits& decided, const PackedBits& sent);

}  // namespace quarzel::tool
