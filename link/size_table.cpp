// SPDX-License-Identifier: MIT
#include "link/size_table.hpp"

#include <algorithm>

namespace quarzel::link {

namespace {

/// The first row whose block size is K or more.
auto atLeast(std::uint64_t K) {
    return std::lower_bound(lteParams.begin(), lteParams.end(), K,
                            [](const LteParams& row, std::uint64_t size) { return row.K < size; });
}

/// K of a block with this many positions; 0, which is no block size, when there is not even a tail.
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

const LteParams* findBlockSize(std::uint64_t K) {
    const auto row = atLeast(K);
    return row != lteParams.end() && row->K == K ? &*row : nullptr;
}

const LteParams* findPositions(std::uint64_t positions) {
    return findBlockSize(sizeAt(positions));
}

std::vector<std::uint32_t> nearestBlockSizes(std::uint64_t K) {
    const auto above = atLeast(K);
    std::vector<std::uint32_t> sizes;
    if (above != lteParams.begin()) {
        sizes.push_back((above - 1)->K);
    }
    if (above != lteParams.end()) {
        sizes.push_back(above->K);
    }
    return sizes;
}

std::string nearestBlockSizesText(std::uint64_t K) {
    return joinNearest(K, [](std::uint32_t size) { return std::to_string(size); });
}

std::string nearestPositionsText(std::uint64_t positions) {
    return joinNearest(sizeAt(positions), [](std::uint32_t size) {
        return std::to_string(size + tailPositions) + " (K = " + std::to_string(size) + ")";
    });
}

}  // namespace quarzel::link
