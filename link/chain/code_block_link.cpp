// SPDX-License-Identifier: MIT
#include "link/chain/code_block_link.hpp"

#include <algorithm>
#include <stdexcept>
#include <string>

#include "link/coding/rate_recovery.hpp"

namespace quarzel::link {

namespace {

/// By values: loops over std::clamp, which takes references, are not vectorised.
constexpr std::int8_t sumOf(std::int8_t a, std::int8_t b) {
    const auto sum = static_cast<std::int16_t>(a + b);
    const std::int16_t raised = sum < INT8_MIN ? std::int16_t{INT8_MIN} : sum;
    return static_cast<std::int8_t>(raised > INT8_MAX ? std::int16_t{INT8_MAX} : raised);
}

void add(const std::int8_t* __restrict values, std::size_t count, std::int8_t* __restrict sums) {
    for (std::size_t i = 0; i < count; ++i) {
        sums[i] = sumOf(sums[i], values[i]);
    }
}

void addAt(const std::uint16_t* __restrict places, const std::int8_t* __restrict values, std::size_t count,
           std::int8_t* __restrict sums) {
    for (std::size_t i = 0; i < count; ++i) {
        sums[places[i]] = sumOf(sums[places[i]], values[i]);
    }
}

void setAt(const std::uint16_t* __restrict places, const std::int8_t* __restrict values, std::size_t count,
           std::int8_t* __restrict soft) {
    for (std::size_t i = 0; i < count; ++i) {
        soft[places[i]] = values[i];
    }
}

std::size_t leadingRun(const std::vector<std::uint16_t>& places) {
    std::size_t run = 1;
    while (run < places.size() && places[run] == places[run - 1] + 1) {
        ++run;
    }
    return run;
}

}  // namespace

CodeBlockLink::CodeBlockLink(std::uint32_t K, std::size_t filler, std::size_t E,
                             std::span<const unsigned> rvs, Order order)
    : itsEncoder(K), itsMatching(K, filler), itsCodedBits(E) {
    const std::size_t most = maxRepetitions * itsMatching.codeBits();
    if (E > most) {
        throw std::invalid_argument("a code block of " + std::to_string(K) + " bits is sent as at most " +
                                    std::to_string(most) + " coded bits here, not " + std::to_string(E));
    }
    for (const unsigned rv : rvs) {
        itsPieces.push_back(piecesOf(rv, order));
    }
}

std::vector<CodeBlockLink::Piece> CodeBlockLink::piecesOf(unsigned rv, Order order) const {
    std::vector<std::uint16_t> places;
    forEachPiece(itsMatching, rv, itsCodedBits, [&](std::size_t, std::size_t first, std::size_t count) {
        const auto sent = itsMatching.places().subspan(first, count);
        places.insert(places.end(), sent.begin(), sent.end());
    });
    std::vector<Piece> pieces;
    if (order == Order::sent) {
        pieces.push_back({std::move(places), 0, itsCodedBits <= itsMatching.codeBits()});
    } else {
        std::vector<std::size_t> times(softValues());
        for (const std::uint16_t place : places) {
            if (times[place] == pieces.size()) {
                pieces.emplace_back();
            }
            pieces[times[place]++].places.push_back(place);
        }
    }
    for (Piece& piece : pieces) {
        if (order == Order::streams) {
            std::sort(piece.places.begin(), piece.places.end());
            piece.isOnce = true;
        }
        piece.run = leadingRun(piece.places);
    }
    return pieces;
}

std::vector<std::uint16_t> CodeBlockLink::places(std::size_t transmission) const {
    std::vector<std::uint16_t> places;
    for (const Piece& piece : itsPieces[transmission]) {
        places.insert(places.end(), piece.places.begin(), piece.places.end());
    }
    return places;
}

void CodeBlockLink::select(std::size_t transmission, const std::uint8_t* codeBits,
                           std::uint8_t* coded) const {
    for (const Piece& piece : itsPieces[transmission]) {
        coded = std::copy_n(codeBits + piece.places[0], piece.run, coded);
        coded =
            std::transform(piece.places.begin() + static_cast<std::ptrdiff_t>(piece.run), piece.places.end(),
                           coded, [codeBits](std::uint16_t place) { return codeBits[place]; });
    }
}

void CodeBlockLink::send(const Channel& channel, BlockName name, const std::uint8_t* coded, unsigned lane,
                         std::int8_t* received, std::int8_t* soft) const {
    const bool isFirst = name.transmission == 0;
    if (isFirst) {
        std::fill_n(soft, softValues(), std::int8_t{0});
        std::fill_n(soft, itsMatching.filler(), fillerSoft);
        std::fill_n(soft + itsMatching.positions(), itsMatching.filler(), fillerSoft);
    }
    for (const Piece& piece : itsPieces[name.transmission]) {
        const std::size_t count = piece.places.size();
        channel.transmit(RandomSource(name), coded, lane, count, received);
        const std::uint16_t* const others = piece.places.data() + piece.run;
        add(received, piece.run, soft + piece.places[0]);
        // Nothing is there yet where each bit of the first transmission comes once.
        const bool isNew = isFirst && name.repetition == 0 && piece.isOnce;
        (isNew ? setAt : addAt)(others, received + piece.run, count - piece.run, soft);
        coded += count;
        received += count;
        ++name.repetition;
    }
}

}  // namespace quarzel::link
