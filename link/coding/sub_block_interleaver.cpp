// SPDX-License-Identifier: MIT
#include "link/coding/sub_block_interleaver.hpp"

#include <array>
#include <stdexcept>
#include <string>

#include "link/coding/require.hpp"
#include "link/coding/segmentation.hpp"
#include "quarzel/code.hpp"

namespace quarzel::link {

namespace {

/// P, the order of the columns: the five bits of each number in reverse.
constexpr std::array<std::uint8_t, subBlockColumns> columns = [] {
    std::array<std::uint8_t, subBlockColumns> order{};
    for (std::size_t k = 0; k < subBlockColumns; ++k) {
        for (std::size_t bit = 0; bit < 5; ++bit) {
            order[k] = static_cast<std::uint8_t>(order[k] | (k >> bit & 1U) << (4 - bit));
        }
    }
    return order;
}();

}  // namespace

std::vector<std::uint16_t> subBlockInterleaving(std::size_t D, unsigned stream) {
    if (D == 0 || D > maxBlockSize + quarzel::tailPositions) {
        throw std::invalid_argument("a stream has 1 to " +
                                    std::to_string(maxBlockSize + quarzel::tailPositions) + " values, not " +
                                    std::to_string(D));
    }
    if (stream > 2) {
        throw std::invalid_argument("the streams are 0, 1 and 2; there is no " + std::to_string(stream));
    }
    const std::size_t rows = subBlockRows(D);
    const std::size_t size = subBlockColumns * rows;
    const std::size_t dummies = size - D;
    const std::size_t shift = stream == 2 ? 1 : 0;
    std::vector<std::uint16_t> places;
    places.reserve(size);
    for (const std::size_t column : columns) {
        for (std::size_t row = 0; row < rows; ++row) {
            const std::size_t place = (column + subBlockColumns * row + shift) % size;
            places.push_back(place < dummies ? dummyPosition : static_cast<std::uint16_t>(place - dummies));
        }
    }
    return places;
}

void subBlockInterleave(std::span<const std::uint8_t> values, unsigned stream,
                        std::span<std::uint8_t> interleaved) {
    const std::vector<std::uint16_t> places = subBlockInterleaving(values.size(), stream);
    requireSize("interleaved values", interleaved.size(), places.size());
    for (std::size_t k = 0; k < places.size(); ++k) {
        interleaved[k] = places[k] == dummyPosition ? nullBit : values[places[k]];
    }
}

void subBlockDeinterleave(std::span<const std::int16_t> interleaved, unsigned stream,
                          std::span<std::int16_t> values) {
    const std::vector<std::uint16_t> places = subBlockInterleaving(values.size(), stream);
    requireSize("interleaved values", interleaved.size(), places.size());
    for (std::size_t k = 0; k < places.size(); ++k) {
        if (places[k] != dummyPosition) {
            values[places[k]] = interleaved[k];
        }
    }
}

}  // namespace quarzel::link
