// SPDX-License-Identifier: MIT
#pragma once

#include <array>

#include "fixed/unrolled.hpp"
#include "lanes/lane_word.hpp"

// Between the caller's arrays, where the steps of a segment stand in a row, and the rows of a group, where
// the segments of a step do: eight by eight at a time.
namespace quarzel::lanes {
namespace {

/// Eight vectors. Each slice position of them is a square of eight by eight words.
template <std::size_t W>
using Squares = std::array<Lanes<W>, sliceLanes>;

/// Words of two slices in turns, from their lower or upper halves.
inline Lanes<8> interleaveLow(Lanes<8> x, Lanes<8> y) {
    return {__builtin_shufflevector(x.v, y.v, 0, 8, 1, 9, 2, 10, 3, 11)};
}
inline Lanes<8> interleaveHigh(Lanes<8> x, Lanes<8> y) {
    return {__builtin_shufflevector(x.v, y.v, 4, 12, 5, 13, 6, 14, 7, 15)};
}
inline Lanes<16> interleaveLow(Lanes<16> x, Lanes<16> y) {
    return {__builtin_shufflevector(x.v, y.v, 0, 16, 1, 17, 2, 18, 3, 19, 8, 24, 9, 25, 10, 26, 11, 27)};
}
inline Lanes<16> interleaveHigh(Lanes<16> x, Lanes<16> y) {
    return {__builtin_shufflevector(x.v, y.v, 4, 20, 5, 21, 6, 22, 7, 23, 12, 28, 13, 29, 14, 30, 15, 31)};
}

/// Interleave each vector with the one four further on; done three times, rows become columns.
template <std::size_t W>
inline Squares<W> interleaveHalves(const Squares<W>& x) {
    Squares<W> y;
    unrolled<4>([&](auto i) {
        y[2 * i] = interleaveLow(x[i], x[i + 4]);
        y[2 * i + 1] = interleaveHigh(x[i], x[i + 4]);
    });
    return y;
}

template <std::size_t W>
inline Squares<W> transpose(const Squares<W>& x) {
    return interleaveHalves<W>(interleaveHalves<W>(interleaveHalves<W>(x)));
}

/// Call `visit(slice, word)` for every slice of a group, with the word of its first step row.
template <class Visit>
inline void forEachSlice(const LaneGroup& group, Visit visit) {
    for (std::size_t slice = 0; slice < group.slices; ++slice) {
        for (std::size_t bundle = 0; bundle < group.bundles; ++bundle) {
            visit(slice * group.bundles + bundle, slice * group.sliceWords + bundle * sliceLanes);
        }
    }
}

/// Write a byte for each of the first Count LLRs: 1 where it is not negative.
template <std::size_t Count>
inline void storeBits(Lanes<8> llr, unsigned char* to) {
    typedef std::uint8_t Bytes __attribute__((vector_size(8)));
    const auto bits = __builtin_convertvector(~(Lanes<8>::Unsigned)llr.v >> 15, Bytes);
    std::memcpy(to, &bits, Count);
}

/// Write the decisions of every LLR.
/// @param offset  from the place of the decisions after the first iteration
inline void writeDecisions(const LaneGroup& group, std::ptrdiff_t offset) {
    forEachSlice(group, [&](std::size_t slice, std::size_t word) {
        unsigned char* const* lanes = group.outputs + slice * sliceLanes;
        const std::int16_t* const first = group.llr + word;
        const auto eightRows = [&](std::size_t t) {
            Squares<8> square;
            unrolled<sliceLanes>(
                [&](auto i) { square[i] = Lanes<8>::load(first + (t + i) * group.rowWords); });
            square = transpose<8>(square);
            unrolled<sliceLanes>([&](auto lane) {
                if (lanes[lane] != nullptr) {
                    storeBits<8>(square[lane], lanes[lane] + offset + t);
                }
            });
        };
        for (std::size_t t = 0; t + 8 < group.steps; t += 8) {
            eightRows(t);
        }
        // The last eight may overlap those before.
        eightRows(group.steps - 8);
    });
}

}  // namespace
}  // namespace quarzel::lanes
