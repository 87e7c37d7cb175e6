// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace quarzel::tool {

/// The soft values of one code block: K + 4 systematic ones, K + 4 of the first parity, K + 4 of the second.
using SoftBlock = std::vector<int>;

/// Code blocks of one size, as a receiver has recorded them.
struct Capture {
    std::string file;             ///< where it was read
    std::uint32_t blockSize = 0;  ///< K, a valid block size
    std::vector<SoftBlock> blocks;
};

/// Read a capture: an npy file of int8, int16 or int32 values of shape (blocks, 3, K + 4), or CSV. Memory
/// grows with what the file holds, not with what its header claims.
///
/// @throws ToolError when the file cannot be read, is not well-formed, holds no block or has a K that LTE
///                   does not have
Capture readCapture(const std::string& file);

}  // namespace quarzel::tool
