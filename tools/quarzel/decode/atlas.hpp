// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <span>

namespace quarzel::tool {

/// The Eb/N0 at which a block error rate is reached: 2 units, code bits sent once as BPSK over white Gaussian
/// noise, the default quantiser.
struct AtlasRow {
    std::uint32_t blockSize;  ///< K
    int algorithm;
    int iterations;
    double bler;
    double ebN0;  ///< in dB, as the next ones
    double low;   ///< the interval holds it with a probability of 95 %
    double high;
};

/// The rows of docs/atlas/thresholds.csv for a block size, by algorithm, iterations and falling rate. Empty
/// for what is no block size. The rows live as long as the program.
std::span<const AtlasRow> atlasOf(std::uint32_t K);

}  // namespace quarzel::tool
