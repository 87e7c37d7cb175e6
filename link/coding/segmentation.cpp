// SPDX-License-Identifier: MIT
#include "link/coding/segmentation.hpp"

#include <algorithm>
#include <stdexcept>

#include "link/coding/crc.hpp"
#include "link/coding/require.hpp"
#include "quarzel/code.hpp"

namespace quarzel::link {

namespace {

constexpr std::size_t crcSize = 24;

/// Show each block's own bits, in order: their place and number in the blocks, and their place among all.
template <class Visit>
void forEachBlock(const Segmentation& segmentation, Visit visit) {
    const std::size_t parity = segmentation.C > 1 ? crcSize : 0;
    std::size_t end = 0;
    std::size_t from = 0;
    for (std::size_t r = 0; r < segmentation.C; ++r) {
        const std::size_t place = end + (r == 0 ? segmentation.F : 0);
        end += segmentation.size(r);
        const std::size_t count = end - place - parity;
        visit(place, count, from);
        from += count;
    }
}

}  // namespace

Segmentation segmentationOf(std::size_t B) {
    if (B == 0) {
        throw std::invalid_argument("there must be at least 1 bit to cut into code blocks, not 0");
    }
    static const std::vector<BlockSize> sizes = blockSizes();
    const std::size_t C = B <= maxBlockSize ? 1 : (B + maxBlockSize - crcSize - 1) / (maxBlockSize - crcSize);
    const std::size_t withCrcs = B + (C > 1 ? C * crcSize : 0);
    const auto plus =
        std::lower_bound(sizes.begin(), sizes.end(), withCrcs,
                         [C](const BlockSize& row, std::size_t bits) { return C * row.K < bits; });
    Segmentation result{B, C, plus->K, 0, C, 0, 0};
    if (C > 1) {
        result.Kminus = (plus - 1)->K;
        result.Cminus = (C * result.Kplus - withCrcs) / (result.Kplus - result.Kminus);
        result.Cplus = C - result.Cminus;
    }
    result.F = result.totalSize() - withCrcs;
    return result;
}

void segment(const Segmentation& segmentation, std::span<const std::uint8_t> bits,
             std::span<std::uint8_t> blocks) {
    requireSize("bits to cut into code blocks", bits.size(), segmentation.B);
    requireSize("bits of code blocks", blocks.size(), segmentation.totalSize());
    std::fill_n(blocks.begin(), segmentation.F, nullBit);
    forEachBlock(segmentation, [&](std::size_t place, std::size_t count, std::size_t from) {
        const auto own = bits.subspan(from, count);
        std::copy(own.begin(), own.end(), blocks.begin() + static_cast<std::ptrdiff_t>(place));
        if (segmentation.C > 1) {
            // Filler counts as 0, which leaves no remainder.
            writeCrc(Crc::crc24B, own, blocks.subspan(place + count, crcSize));
        }
    });
}

std::vector<bool> desegment(const Segmentation& segmentation, std::span<const std::uint8_t> blocks,
                            std::span<std::uint8_t> bits) {
    requireSize("bits of code blocks", blocks.size(), segmentation.totalSize());
    requireSize("bits of a transport block with its CRC", bits.size(), segmentation.B);
    std::vector<bool> holds;
    forEachBlock(segmentation, [&](std::size_t place, std::size_t count, std::size_t from) {
        const auto own = blocks.subspan(place, count);
        std::copy(own.begin(), own.end(), bits.begin() + static_cast<std::ptrdiff_t>(from));
        holds.push_back(segmentation.C == 1 || crcHolds(Crc::crc24B, blocks.subspan(place, count + crcSize)));
    });
    return holds;
}

}  // namespace quarzel::link
