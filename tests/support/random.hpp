// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <iostream>
#include <random>
#include <vector>

#include "engine/t8.hpp"

namespace quarzel::test {

/// A random source for one test. It prints its seed, which is a new one each time, or the one in the
/// environment variable QUARZEL_TEST_SEED, so that a failure can be run again.
inline std::mt19937 seededRandom() {
    const char* chosen = std::getenv("QUARZEL_TEST_SEED");
    const auto seed = static_cast<std::mt19937::result_type>(
        chosen != nullptr ? std::strtoul(chosen, nullptr, 10) : std::random_device{}());
    std::cout << "QUARZEL_TEST_SEED=" << seed << '\n';
    return std::mt19937(seed);
}

/// Any 16-bit word; one in eight is at an end of the range.
inline std::int16_t randomWord(std::mt19937& random) {
    if (std::uniform_int_distribution<int>(0, 7)(random) == 0) {
        return random() % 2 == 0 ? INT16_MIN : INT16_MAX;
    }
    return static_cast<std::int16_t>(std::uniform_int_distribution<int>(INT16_MIN, INT16_MAX)(random));
}

inline std::vector<std::int16_t> randomWords(std::mt19937& random, std::size_t size) {
    std::vector<std::int16_t> words(size);
    for (std::int16_t& word : words) {
        word = randomWord(random);
    }
    return words;
}

inline T8 randomRecord(std::mt19937& random) {
    T8 record{};
    for (std::int16_t& word : record.element) {
        word = randomWord(random);
    }
    return record;
}

inline std::vector<T8> randomRecords(std::mt19937& random, std::size_t size) {
    std::vector<T8> records(size);
    for (T8& record : records) {
        record = randomRecord(random);
    }
    return records;
}

}  // namespace quarzel::test
