// SPDX-License-Identifier: MIT
#pragma once

#include <malloc.h>

#include <cstddef>
#include <random>
#include <vector>

#include "quarzel/core.hpp"

namespace quarzel::bench {

constexpr int iterations = 6;

/// Bytes that the program holds on the heap.
inline std::size_t heapBytes() {
    const struct mallinfo2 info = mallinfo2();
    return info.uordblks + info.hblkhd;
}

inline Core makeCore(std::int64_t units, std::int64_t algorithm) {
    return Core(CoreSettings{static_cast<int>(units), static_cast<int>(algorithm)});
}

/// Noisy blocks of the all-zero code word, at an amplitude of 1.0 and 0 dB, with room for their decisions.
struct Blocks {
    std::size_t K;
    std::vector<int> soft;
    std::vector<unsigned char> bits;
    std::vector<vardel_ip_quarzel_inputs> inputs;
    std::vector<vardel_ip_quarzel_outputs> outputs;

    Blocks(std::size_t size, std::size_t count) : K(size), bits(size * count) {
        std::mt19937 random(1);
        std::normal_distribution<float> value(-8.0F, 8.0F);
        for (std::size_t i = 0; i < 3 * (K + 4) * count; ++i) {
            soft.push_back(static_cast<int>(value(random)));
        }
        for (std::size_t block = 0; block < count; ++block) {
            const int* streams = soft.data() + 3 * (K + 4) * block;
            inputs.push_back(
                {streams, streams + (K + 4), streams + 2 * (K + 4), static_cast<int>(K + 4), iterations, 0});
            outputs.push_back({bits.data() + K * block, static_cast<int>(K), 0, 0});
        }
    }

    double informationBits() const { return static_cast<double>(bits.size()); }
};

}  // namespace quarzel::bench
