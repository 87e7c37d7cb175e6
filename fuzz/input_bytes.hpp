// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <type_traits>

namespace quarzel::fuzz {

/// The bytes of an input, taken from the front as values of any kind. What is missing is 0.
class InputBytes {
  public:
    InputBytes(const std::uint8_t* data, std::size_t size) : itsData(data), itsSize(size) {}

    bool empty() const { return itsSize == 0; }
    std::size_t size() const { return itsSize; }

    /// A value of any bits.
    template <class Value>
    requires std::is_arithmetic_v<Value> Value take() {
        Value value{};
        const std::size_t count = std::min(sizeof value, itsSize);
        if (count != 0) {
            std::memcpy(&value, itsData, count);
        }
        drop(count);
        return value;
    }

    /// A whole number from `least` to `most`, of one byte while these are less than 256 apart.
    int takeFrom(int least, int most) {
        const auto range = static_cast<unsigned>(most - least) + 1;
        const unsigned drawn = range <= 256 ? take<std::uint8_t>() : take<std::uint32_t>();
        return least + static_cast<int>(drawn % range);
    }

    bool takeBool() { return (take<std::uint8_t>() & 1) != 0; }

    /// Up to `most` bytes.
    std::string takeText(std::size_t most) {
        std::string text(reinterpret_cast<const char*>(itsData), std::min(most, itsSize));
        drop(text.size());
        return text;
    }

    std::string rest() { return takeText(itsSize); }

  private:
    void drop(std::size_t count) {
        itsData += count;
        itsSize -= count;
    }

    const std::uint8_t* itsData;
    std::size_t itsSize;
};

}  // namespace quarzel::fuzz
