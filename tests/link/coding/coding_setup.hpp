// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

#include "link/coding/segmentation.hpp"
#include "link/coding/standard_coding.hpp"

namespace quarzel::test {

using Bytes = std::vector<std::uint8_t>;

/// Whether the environment asks for whole domains where a random part is tried otherwise.
inline bool isExhaustive() {
    return std::getenv("QUARZEL_TEST_EXHAUSTIVE") != nullptr;
}

inline Bytes randomBits(std::mt19937& random, std::size_t size) {
    Bytes bits(size);
    std::generate(bits.begin(), bits.end(), [&] { return static_cast<std::uint8_t>(random() & 1U); });
    return bits;
}

inline int randomBelow(std::mt19937& random, int end) {
    return std::uniform_int_distribution<int>(0, end - 1)(random);
}

inline standard::Bits toStandard(const Bytes& bits) {
    standard::Bits result(bits.begin(), bits.end());
    std::replace(result.begin(), result.end(), int{link::nullBit}, standard::null);
    return result;
}

inline Bytes fromStandard(const standard::Bits& bits) {
    Bytes result;
    for (const int bit : bits) {
        result.push_back(bit == standard::null ? link::nullBit : static_cast<std::uint8_t>(bit));
    }
    return result;
}

/// The first `count` bits of hexadecimal digits, highest first.
inline Bytes bitsOfHex(const std::string& digits, std::size_t count) {
    Bytes bits;
    for (std::size_t i = 0; i < count; ++i) {
        const int digit = std::stoi(digits.substr(i / 4, 1), nullptr, 16);
        bits.push_back(static_cast<std::uint8_t>(digit >> (3 - i % 4) & 1));
    }
    return bits;
}

}  // namespace quarzel::test
