// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

namespace quarzel::test {

/// The block sizes of LTE in ascending order: from 40 in steps of 8, which double beyond 512, 1024 and 2048.
inline std::vector<std::uint32_t> lteBlockSizes() {
    std::vector<std::uint32_t> sizes;
    std::uint32_t step = 8;
    for (std::uint32_t K = 40; K <= 6144; K += step) {
        sizes.push_back(K);
        if (K == 512 || K == 1024 || K == 2048) {
            step *= 2;
        }
    }
    return sizes;
}

}  // namespace quarzel::test
