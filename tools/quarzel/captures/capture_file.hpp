// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <istream>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "quarzel/core.hpp"

namespace quarzel::tool {

/// Code blocks of one size, as a receiver has recorded them.
struct Capture {
    std::string file;             ///< where it was read
    std::uint32_t blockSize = 0;  ///< K, a valid block size
    /// Of each block K + 4 systematic values, K + 4 of the first parity, K + 4 of the second.
    std::vector<std::int32_t> soft;

    std::size_t positions() const { return blockSize + tailPositions; }
    std::size_t blocks() const { return soft.size() / (3 * positions()); }

    /// `count` blocks from the block `first` on.
    SoftBlocks<std::int32_t> part(std::size_t first, std::size_t count) const {
        const std::size_t values = 3 * positions();
        return softBlocks(std::span(soft).subspan(first * values, count * values), positions());
    }
};

/// Read a capture: an npy file of shape (blocks, 3, K + 4), or CSV. Memory grows with what the file holds,
/// not with what its header claims.
///
/// @param file   its name, also for error messages; one that ends with .npy tells the format
/// @param scale  without it, the file holds soft values; with it, real numbers that are quantised with it
/// @throws ToolError when it is not well-formed, holds no block or has a K that LTE does not have
Capture readCapture(std::istream& stream, const std::string& file, std::optional<double> scale = {});

/// The bytes of an npy file of shape (blocks, 3, K + 4) that holds soft values of 8 bits.
/// @param soft  blocks of 3 (K + 4) values each
std::string softNpy(std::span<const std::int8_t> soft, std::uint32_t K);

}  // namespace quarzel::tool
