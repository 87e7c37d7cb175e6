// SPDX-License-Identifier: MIT
#include "link/bit_errors.hpp"

#include <algorithm>
#include <cstring>

namespace quarzel::link {

std::uint32_t bitErrors(const std::uint8_t* sent, unsigned lane, const std::uint8_t* decisions,
                        std::size_t count) {
    constexpr std::uint64_t ones = 0x0101010101010101;
    constexpr std::uint64_t evenBytes = 0x00ff00ff00ff00ff;
    constexpr std::size_t maxAtOnce = std::size_t{255} * 8;  // sums that a byte can hold
    const std::size_t whole = count - count % 8;
    std::uint64_t total = 0;
    for (std::size_t start = 0; start < whole; start += maxAtOnce) {
        const std::size_t end = std::min(start + maxAtOnce, whole);
        std::uint64_t sums = 0;
        for (std::size_t i = start; i < end; i += 8) {
            std::uint64_t bits = 0;
            std::uint64_t decided = 0;
            std::memcpy(&bits, sent + i, 8);
            std::memcpy(&decided, decisions + i, 8);
            sums += (bits >> lane & ones) ^ decided;
        }
        sums = (sums & evenBytes) + (sums >> 8 & evenBytes);
        total += sums * 0x0001000100010001 >> 48;
    }
    for (std::size_t i = whole; i < count; ++i) {
        total += (sent[i] >> lane & 1U) ^ decisions[i];
    }
    return static_cast<std::uint32_t>(total);
}

}  // namespace quarzel::link
