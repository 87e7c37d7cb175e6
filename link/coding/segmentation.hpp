// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

/// Code block segmentation (3GPP TS 36.212, section 5.1.2), there and back. Bits are bytes of 0 or 1. All
/// functions are pure.
namespace quarzel::link {

/// What stands for <NULL>, at filler bits.
inline constexpr std::uint8_t nullBit = 255;

/// Z, the bits of the largest code block.
inline constexpr std::size_t maxBlockSize = 6144;

/// How B bits, a transport block with its CRC, are cut into code blocks. The names are the standard's.
struct Segmentation {
    std::size_t B;
    std::size_t C;         ///< code blocks
    std::uint32_t Kplus;   ///< size of the last Cplus blocks
    std::uint32_t Kminus;  ///< size of the first Cminus blocks; 0 when there is one block
    std::size_t Cplus, Cminus;
    std::size_t F;  ///< filler bits in front of block 0

    /// K_r, the size of block r.
    std::uint32_t size(std::size_t r) const { return r < Cminus ? Kminus : Kplus; }

    /// The bits of all blocks, filler and CRCs included.
    std::size_t totalSize() const { return Cminus * Kminus + Cplus * Kplus; }
};

/// @param B  bits, with the CRC of the transport block
/// @throws std::invalid_argument for 0
Segmentation segmentationOf(std::size_t B);

/// Cut bits into code blocks, each with a CRC24B when there are several.
/// @param bits    B bits, of one transport block or of 8 together: bit i of every byte belongs to block i
/// @param blocks  receives the blocks one after another, `totalSize` values: bits of the same form, and
/// nullBit for
///                filler
/// @throws std::invalid_argument when a size does not fit
void segment(const Segmentation& segmentation, std::span<const std::uint8_t> bits,
             std::span<std::uint8_t> blocks);

/// Put the bits of code blocks together again. What stands at filler bits does not matter.
/// @param blocks  `totalSize` decisions
/// @param bits    receives B bits
/// @return        for each block, whether its CRC24B holds; a block that is alone has none, and it holds
/// @throws std::invalid_argument when a size does not fit
std::vector<bool> desegment(const Segmentation& segmentation, std::span<const std::uint8_t> blocks,
                            std::span<std::uint8_t> bits);

}  // namespace quarzel::link
