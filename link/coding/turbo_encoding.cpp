// SPDX-License-Identifier: MIT
#include "link/coding/turbo_encoding.hpp"

#include <algorithm>
#include <string>
#include <vector>

#include "link/coding/require.hpp"
#include "link/coding/segmentation.hpp"

namespace quarzel::link {

void requireFiller(std::size_t filler, std::size_t K) {
    if (filler >= K) {
        throw std::invalid_argument("a block of " + std::to_string(K) + " bits has 0 to " +
                                    std::to_string(K - 1) + " filler bits, not " + std::to_string(filler));
    }
}

void turboEncode(const Encoder& encoder, std::span<const std::uint8_t> block, std::size_t filler,
                 std::span<std::uint8_t> streams) {
    requireSize("bits of a code block", block.size(), encoder.blockSize());
    requireSize("code bits", streams.size(), 3 * encoder.positions());
    requireFiller(filler, encoder.blockSize());
    if (filler == 0) {
        encoder.encode(block.data(), streams.data());
        return;
    }
    std::vector<std::uint8_t> bits(block.begin(), block.end());
    std::fill_n(bits.begin(), filler, std::uint8_t{0});
    encoder.encode(bits.data(), streams.data());
    std::fill_n(streams.data(), filler, nullBit);
    std::fill_n(streams.data() + encoder.positions(), filler, nullBit);
}

}  // namespace quarzel::link
