// SPDX-License-Identifier: MIT
#include "link/coding/rate_matching.hpp"

#include <stdexcept>
#include <string>

#include "link/coding/coded_sizes.hpp"
#include "link/coding/require.hpp"
#include "link/coding/sub_block_interleaver.hpp"
#include "link/coding/turbo_encoding.hpp"
#include "link/size_table.hpp"

namespace quarzel::link {

namespace {

/// What each entry of the whole w holds: a place in the three streams, or dummyPosition.
std::vector<std::uint16_t> wholeBuffer(std::size_t positions) {
    std::vector<std::uint16_t> systematic = subBlockInterleaving(positions, 0);
    const std::vector<std::uint16_t> parity1 = subBlockInterleaving(positions, 1);
    const std::vector<std::uint16_t> parity2 = subBlockInterleaving(positions, 2);
    const auto placeIn = [positions](std::size_t stream, std::uint16_t position) {
        return position == dummyPosition ? position
                                         : static_cast<std::uint16_t>(stream * positions + position);
    };
    std::vector<std::uint16_t> w = std::move(systematic);
    const std::size_t size = w.size();
    w.reserve(3 * size);
    for (std::size_t k = 0; k < size; ++k) {
        w.push_back(placeIn(1, parity1[k]));
        w.push_back(placeIn(2, parity2[k]));
    }
    return w;
}

}  // namespace

RateMatching::RateMatching(std::uint32_t K, std::size_t filler, std::optional<std::size_t> bufferSize)
    : itsK(checkedBlockSize(K)), itsFiller(filler), itsBufferSize(bufferSize.value_or(wholeBufferSize(K))) {
    requireFiller(filler, K);
    collect();
    const std::size_t rows = subBlockRows(positions());
    for (std::size_t rv = 0; rv < itsStarts.size(); ++rv) {
        const std::size_t step = 2 * ((itsBufferSize + 8 * rows - 1) / (8 * rows));
        itsStarts[rv] = firstAtOrAfter(rows * (step * rv + 2) % itsBufferSize);
    }
}

void RateMatching::collect() {
    const std::vector<std::uint16_t> w = wholeBuffer(positions());
    const auto isCodeBit = [this](std::uint16_t place) {
        const bool isFiller = place < 2 * positions() && place % positions() < itsFiller;
        return place != dummyPosition && !isFiller;
    };
    const auto first = static_cast<std::size_t>(std::find_if(w.begin(), w.end(), isCodeBit) - w.begin());
    if (itsBufferSize <= first || itsBufferSize > w.size()) {
        throw std::invalid_argument("the circular buffer of a block of " + std::to_string(itsK) + " bits, " +
                                    std::to_string(itsFiller) + " of them filler, has " +
                                    std::to_string(first + 1) + " to " + std::to_string(w.size()) +
                                    " entries, not " + std::to_string(itsBufferSize));
    }
    for (std::size_t entry = 0; entry < itsBufferSize; ++entry) {
        if (isCodeBit(w[entry])) {
            itsPlaces.push_back(w[entry]);
            itsEntries.push_back(static_cast<std::uint16_t>(entry));
        }
    }
}

/// After the last code bit comes the first one again.
std::size_t RateMatching::firstAtOrAfter(std::size_t entry) const {
    const auto found = std::lower_bound(itsEntries.begin(), itsEntries.end(), entry);
    return static_cast<std::size_t>(found - itsEntries.begin()) % itsEntries.size();
}

std::size_t RateMatching::start(unsigned rv) const {
    if (rv >= itsStarts.size()) {
        throw std::invalid_argument("the redundancy version must be 0 to 3, not " + std::to_string(rv));
    }
    return itsStarts[rv];
}

void requireCodedBits(std::size_t E) {
    if (E == 0) {
        throw std::invalid_argument("there must be at least 1 coded bit, not 0");
    }
}

void rateMatch(const RateMatching& matching, unsigned rv, std::span<const std::uint8_t> streams,
               std::span<std::uint8_t> coded) {
    requireSize("code bits", streams.size(), 3 * matching.positions());
    const std::span<const std::uint16_t> places = matching.places();
    forEachPiece(matching, rv, coded.size(), [&](std::size_t from, std::size_t first, std::size_t count) {
        for (std::size_t i = 0; i < count; ++i) {
            coded[from + i] = streams[places[first + i]];
        }
    });
}

}  // namespace quarzel::link
