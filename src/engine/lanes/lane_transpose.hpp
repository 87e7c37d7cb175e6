// SPDX-License-Identifier: MIT
#pragma once

#include <array>

#include "engine/lanes/lane_word.hpp"

// Between the caller's arrays, where the steps of a segment stand in a row, and the rows of a group, where
// the segments of a step do: eight by eight at a time.
namespace quarzel::lanes {
namespace {

using Square = std::array<Lanes<8>, 8>;

/// Interleave each vector with the one four further on; done three times, rows become columns.
inline Square interleaveHalves(const Square& x) {
    Square y;
    for (std::size_t i = 0; i < 4; ++i) {
        y[2 * i].v = __builtin_shufflevector(x[i].v, x[i + 4].v, 0, 8, 1, 9, 2, 10, 3, 11);
        y[2 * i + 1].v = __builtin_shufflevector(x[i].v, x[i + 4].v, 4, 12, 5, 13, 6, 14, 7, 15);
    }
    return y;
}

inline Square transpose(const Square& x) {
    return interleaveHalves(interleaveHalves(interleaveHalves(x)));
}

/// Soft values on their way from the caller's integers to words of the state format, eight at a time.
class SoftInput {
  public:
    /// Four values from each of two places, saturated to the input format. Bits that the first shift moves
    /// out are lost before the comparison, as in the core.
    Lanes<8> toWords(const int* first, const int* second) {
        typedef std::uint32_t Unsigned __attribute__((vector_size(32)));
        Ints values;
        std::memcpy(&values, first, sizeof values / 2);
        std::memcpy(reinterpret_cast<char*>(&values) + sizeof values / 2, second, sizeof values / 2);
        constexpr std::int32_t most = 32512;
        constexpr std::int32_t least = -32768;
        const auto given = (Ints)((Unsigned)values << 8);
        Ints x = given > most ? Ints{} + most : given;
        x = x < least ? Ints{} + least : x;
        itsChanges |= x ^ given;
        return {__builtin_convertvector(x >> 4, Lanes<8>::Signed)};
    }

    /// Whether a value was saturated.
    bool saturated() const {
        std::int32_t changes = 0;
        for (std::size_t i = 0; i < 8; ++i) {
            changes |= itsChanges[i];
        }
        return changes != 0;
    }

  private:
    typedef std::int32_t Ints __attribute__((vector_size(32)));

    Ints itsChanges = {};
};

/// Call `block` for the rows from t to t + 7, for every t that it takes to cover all rows. The last eight may
/// overlap those before.
template <class Block>
inline void forEightRows(std::size_t rows, Block block) {
    for (std::size_t t = 0; t + 8 < rows; t += 8) {
        block(t);
    }
    block(rows - 8);
}

/// Call `visit(octet, word)` for every octet of a group, with the word of its first step row.
template <class Visit>
inline void forEachOctet(const LaneGroup& group, Visit visit) {
    for (std::size_t octet = 0; octet < group.octets; ++octet) {
        for (std::size_t bundle = 0; bundle < group.bundles; ++bundle) {
            visit(octet * group.bundles + bundle, octet * group.octetWords + bundle * octetLanes);
        }
    }
}

/// Fill the rows of the soft inputs from the caller's arrays.
inline void readSteps(const LaneGroup& group, SoftInput& input) {
    std::int16_t* const rows[3] = {group.systematic, group.parity[0], group.parity[1]};
    for (std::size_t stream = 0; stream < 3; ++stream) {
        forEachOctet(group, [&](std::size_t octet, std::size_t word) {
            const std::size_t place = stream * group.octets * group.bundles + octet;
            const int* const* lanes = group.inputs + place * octetLanes;
            std::int16_t* const first = rows[stream] + word;
            forEightRows(group.steps, [&](std::size_t t) {
                Square square;
                for (std::size_t lane = 0; lane < octetLanes; ++lane) {
                    // What comes next lies elsewhere: in other segments, or another stream.
                    __builtin_prefetch(lanes[octetLanes + lane] + t);
                    square[lane] = input.toWords(lanes[lane] + t, lanes[lane] + t + 4);
                }
                square = transpose(square);
                for (std::size_t i = 0; i < square.size(); ++i) {
                    square[i].store(first + (t + i) * group.rowWords);
                }
            });
        });
    }
}

/// Fill the tail octets from the four values of each stream that follow a last segment's.
inline void readTails(const LaneGroup& group, SoftInput& input) {
    const std::size_t octets = group.octets * group.bundles;
    for (std::size_t bundle = 0; bundle < group.bundles; ++bundle) {
        const std::size_t last = (group.octets - 1) * group.bundles + bundle;
        // Two streams side by side fill a square; the third one stands alone.
        static constexpr int nothing[4] = {};
        for (std::size_t stream = 0; stream < 3; stream += 2) {
            Square square;
            for (std::size_t lane = 0; lane < octetLanes; ++lane) {
                const int* const* from = group.inputs + (stream * octets + last) * octetLanes + lane;
                square[lane] = input.toWords(from[0] + group.steps,
                                             stream == 0 ? from[octets * octetLanes] + group.steps : nothing);
            }
            square = transpose(square);
            for (std::size_t i = 0; i < (stream == 0 ? 8U : 4U); ++i) {
                const std::size_t number = 3 * (i % 4) + stream + i / 4;
                square[i].store(group.tail + (bundle * tailOctets + number) * octetLanes);
            }
        }
    }
}

/// Read every value of the caller's, once.
/// @return whether one was saturated
inline bool readInputs(const LaneGroup& group) {
    SoftInput input;
    readSteps(group, input);
    readTails(group, input);
    return input.saturated();
}

/// Write a byte for every LLR in the channel rows: 1 where it is not negative.
inline void writeDecisions(const LaneGroup& group) {
    typedef std::uint8_t Bytes __attribute__((vector_size(8)));
    forEachOctet(group, [&](std::size_t octet, std::size_t word) {
        unsigned char* const* lanes = group.outputs + octet * octetLanes;
        const std::int16_t* const first = group.channel + word;
        forEightRows(group.steps, [&](std::size_t t) {
            Square square;
            for (std::size_t i = 0; i < square.size(); ++i) {
                square[i] = Lanes<8>::load(first + (t + i) * group.rowWords);
            }
            square = transpose(square);
            for (std::size_t lane = 0; lane < octetLanes; ++lane) {
                if (lanes[lane] != nullptr) {
                    const auto signs = ~(Lanes<8>::Unsigned)square[lane].v >> 15;
                    const auto bits = __builtin_convertvector(signs, Bytes);
                    std::memcpy(lanes[lane] + t, &bits, sizeof bits);
                }
            }
        });
    });
}

}  // namespace
}  // namespace quarzel::lanes
