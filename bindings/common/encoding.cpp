// SPDX-License-Identifier: MIT
#include "encoding.hpp"

#include <algorithm>
#include <string>

#include "link/encoder.hpp"
#include "link/size_table.hpp"

namespace quarzel::bindings {

void requireBits(std::span<const std::uint8_t> bits) {
    if (std::any_of(bits.begin(), bits.end(), [](std::uint8_t bit) { return bit > 1; })) {
        throw BindingError(Fault::value, "a bit must be 0 or 1; packed bits have to be unpacked first");
    }
}

Outcome encode(const std::uint8_t* bits, std::size_t K, std::size_t blocks, std::uint8_t* code) noexcept {
    return guarded([&] {
        if (!findBlockSize(K)) {
            throw BindingError(Fault::value, "there is no block size of " + std::to_string(K) +
                                                 " bits; the nearest: " + link::nearestBlockSizesText(K));
        }
        requireBits({bits, K * blocks});
        const link::Encoder encoder(static_cast<std::uint32_t>(K));
        for (std::size_t block = 0; block < blocks; ++block) {
            encoder.encode(bits + K * block, code + 3 * encoder.positions() * block);
        }
    });
}

}  // namespace quarzel::bindings
