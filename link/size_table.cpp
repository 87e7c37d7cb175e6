// SPDX-License-Identifier: MIT
#include "link/size_table.hpp"

#include <algorithm>
#include <stdexcept>

namespace quarzel::link {

namespace {

/// K of a block with this many positions; 0, which is not a block size, when there is not even a tail.
std::uint64_t sizeAt(std::uint64_t positions) {
    return positions < tailPositions ? 0 : positions - tailPositions;
}

template <class ToText>
std::string joinNearest(std::uint64_t K, ToText toText) {
    std::string text;
    for (const std::uint32_t size : nearestBlockSizes(K)) {
        text += (text.empty() ? "" : ", ") + toText(size);
    }
    return text;
}

}  // namespace

std::optional<BlockSize> findPositions(std::uint64_t positions) {
    return findBlockSize(sizeAt(positions));
}

std::vector<std::uint32_t> nearestBlockSizes(std::uint64_t K) {
    const std::vector<BlockSize> all = blockSizes();
    const auto above =
        std::find_if(all.begin(), all.end(), [K](const BlockSize& size) { return size.K >= K; });
    std::vector<std::uint32_t> sizes;
    if (above != all.begin()) {
        sizes.push_back((above - 1)->K);
    }
    if (above != all.end()) {
        sizes.push_back(above->K);
    }
    return sizes;
}

std::string nearestBlockSizesText(std::uint64_t K) {
    return joinNearest(K, [](std::uint32_t size) { return std::to_string(size); });
}

std::uint32_t checkedBlockSize(std::uint32_t K) {
    if (!findBlockSize(K)) {
        throw std::invalid_argument("LTE has no code block of " + std::to_string(K) +
                                    " bits; the nearest sizes: " + nearestBlockSizesText(K));
    }
    return K;
}

std::string nearestPositionsText(std::uint64_t positions) {
    return joinNearest(sizeAt(positions), [](std::uint32_t size) {
        return std::to_string(size + tailPositions) + " (K = " + std::to_string(size) + ")";
    });
}

}  // namespace quarzel::link
