// SPDX-License-Identifier: MIT
#include "link/coding/rate_recovery.hpp"

#include <algorithm>
#include <array>
#include <stdexcept>
#include <string>

#include "link/coding/require.hpp"

namespace quarzel::link {

namespace {

void requireBuffer(const RateMatching& matching, std::span<const std::int16_t> buffer) {
    requireSize("values in the soft buffer", buffer.size(), matching.codeBits());
}

void requireEntries(const RateMatching& matching, std::span<const std::int16_t> entries) {
    requireSize("entries in the circular buffer", entries.size(), matching.bufferSize());
}

/// By values: loops over std::clamp, which takes references, are not vectorised.
constexpr int clipped(int value, int lowest, int highest) {
    const int raised = value < lowest ? lowest : value;
    return raised > highest ? highest : raised;
}

/// Sums are clipped to 16 bits first, as machines can add.
template <class Soft>
void add(const Soft* received, std::size_t count, std::int16_t lowest, std::int16_t highest,
         std::int16_t* sums) {
    for (std::size_t i = 0; i < count; ++i) {
        const auto sum = static_cast<std::int16_t>(clipped(sums[i] + received[i], INT16_MIN, INT16_MAX));
        const std::int16_t raised = sum < lowest ? lowest : sum;
        sums[i] = raised > highest ? highest : raised;
    }
}

template <class Soft>
void recover(const RateMatching& matching, unsigned rv, std::span<const Soft> soft,
             std::span<std::int16_t> buffer, unsigned width) {
    if (width < 2 || width > 16) {
        throw std::invalid_argument("a soft buffer's values have 2 to 16 bits, not " + std::to_string(width));
    }
    requireBuffer(matching, buffer);
    const auto highest = static_cast<std::int16_t>((1 << (width - 1)) - 1);
    const auto lowest = static_cast<std::int16_t>(-highest - 1);
    forEachPiece(matching, rv, soft.size(), [&](std::size_t from, std::size_t first, std::size_t count) {
        add(soft.data() + from, count, lowest, highest, buffer.data() + first);
    });
}

}  // namespace

void rateRecover(const RateMatching& matching, unsigned rv, std::span<const std::int16_t> soft,
                 std::span<std::int16_t> buffer, unsigned width) {
    recover(matching, rv, soft, buffer, width);
}

void rateRecover(const RateMatching& matching, unsigned rv, std::span<const std::int8_t> soft,
                 std::span<std::int16_t> buffer, unsigned width) {
    recover(matching, rv, soft, buffer, width);
}

void readStreams(const RateMatching& matching, std::span<const std::int16_t> buffer,
                 std::span<std::int8_t> streams) {
    requireBuffer(matching, buffer);
    requireSize("values in the three streams", streams.size(), 3 * matching.positions());
    std::fill(streams.begin(), streams.end(), std::int8_t{0});
    std::fill_n(streams.data(), matching.filler(), fillerSoft);
    std::fill_n(streams.data() + matching.positions(), matching.filler(), fillerSoft);
    const std::span<const std::uint16_t> places = matching.places();
    // Clipped in portions, which can be vectorised, and then spread.
    std::array<std::int8_t, 512> portion;
    for (std::size_t first = 0; first < buffer.size(); first += portion.size()) {
        const std::size_t count = std::min(portion.size(), buffer.size() - first);
        for (std::size_t i = 0; i < count; ++i) {
            portion[i] = static_cast<std::int8_t>(clipped(buffer[first + i], INT8_MIN, INT8_MAX));
        }
        for (std::size_t i = 0; i < count; ++i) {
            streams[places[first + i]] = portion[i];
        }
    }
}

void readEntries(const RateMatching& matching, std::span<const std::int16_t> entries,
                 std::span<std::int16_t> buffer) {
    requireEntries(matching, entries);
    requireBuffer(matching, buffer);
    for (std::size_t i = 0; i < buffer.size(); ++i) {
        buffer[i] = entries[matching.entries()[i]];
    }
}

void writeEntries(const RateMatching& matching, std::span<const std::int16_t> buffer,
                  std::span<std::int16_t> entries) {
    requireBuffer(matching, buffer);
    requireEntries(matching, entries);
    std::fill(entries.begin(), entries.end(), std::int16_t{0});
    for (std::size_t i = 0; i < buffer.size(); ++i) {
        entries[matching.entries()[i]] = buffer[i];
    }
}

}  // namespace quarzel::link
