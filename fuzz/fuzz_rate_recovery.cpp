// SPDX-License-Identifier: MIT
// Rate matching and its inverse, of any sizes, also of those that do not exist.
#include <stdexcept>
#include <vector>

#include "input_bytes.hpp"
#include "link/coding/rate_recovery.hpp"
#include "require.hpp"

namespace {

using namespace quarzel;

/// Soft values of 5 and -5 for coded bits: what is recovered has the signs of the bits that were sent.
void sendAndReceive(const link::RateMatching& matching, unsigned rv, std::size_t E, fuzz::InputBytes& bytes) {
    std::vector<std::uint8_t> streams(3 * matching.positions());
    for (std::uint8_t& bit : streams) {
        bit = bytes.takeBool() ? 1 : 0;
    }
    std::vector<std::uint8_t> coded(E);
    link::rateMatch(matching, rv, streams, coded);
    std::vector<std::int8_t> soft(E);
    for (std::size_t i = 0; i < E; ++i) {
        soft[i] = coded[i] != 0 ? 5 : -5;
    }
    std::vector<std::int16_t> buffer(matching.codeBits());
    link::rateRecover(matching, rv, std::span<const std::int8_t>(soft), buffer);
    for (std::size_t i = 0; i < buffer.size(); ++i) {
        const bool sent = streams[matching.places()[i]] != 0;
        fuzz::require(buffer[i] == 0 || (buffer[i] > 0) == sent,
                      "a recovered value has the sign that was sent");
    }
    std::vector<std::int8_t> received(streams.size());
    link::readStreams(matching, buffer, received);
    std::vector<std::int16_t> entries(matching.bufferSize());
    std::vector<std::int16_t> again(buffer.size());
    link::writeEntries(matching, buffer, entries);
    link::readEntries(matching, entries, again);
    fuzz::require(again == buffer, "the entries of w hold the buffer");
}

void combine(const link::RateMatching& matching, unsigned rv, std::size_t E, fuzz::InputBytes& bytes) {
    const auto width = static_cast<unsigned>(bytes.takeFrom(0, 18));
    std::vector<std::int16_t> buffer(matching.codeBits() + (bytes.takeFrom(0, 15) == 0 ? 1U : 0U));
    for (int sent = 0; sent < 2; ++sent) {
        std::vector<std::int16_t> soft(E);
        for (std::int16_t& value : soft) {
            value = bytes.take<std::int16_t>();
        }
        link::rateRecover(matching, rv, std::span<const std::int16_t>(soft), buffer, width);
        for (const std::int16_t value : buffer) {
            fuzz::require(value >= -(1 << (width - 1)) && value < 1 << (width - 1), "a sum is clipped");
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::InputBytes bytes(data, size);
    const bool isHostile = bytes.takeBool();
    const std::uint32_t K =
        isHostile ? bytes.take<std::uint32_t>() : static_cast<unsigned>(bytes.takeFrom(5, 64)) * 8;
    const std::size_t filler = isHostile ? bytes.take<std::size_t>() : bytes.take<std::uint8_t>();
    std::optional<std::size_t> bufferSize;
    if (bytes.takeBool()) {
        bufferSize = isHostile ? bytes.take<std::size_t>() : bytes.take<std::uint16_t>();
    }
    const auto rv = static_cast<unsigned>(bytes.takeFrom(0, 4));
    const auto E = static_cast<std::size_t>(bytes.takeFrom(0, 4095));
    try {
        const link::RateMatching matching(K, filler, bufferSize);
        if (bytes.takeBool()) {
            sendAndReceive(matching, rv, E, bytes);
        } else {
            combine(matching, rv, E, bytes);
        }
    } catch (const std::invalid_argument&) {
    }
    return 0;
}
