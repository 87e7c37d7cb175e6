// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

#include "link/channel/channel.hpp"
#include "link/coding/rate_matching.hpp"
#include "link/encoder.hpp"

namespace quarzel::link {

/// The way of code blocks of one size from their code bits to the three streams of a core, over one or
/// several transmissions.
///
/// Thread rule: it does not change once it is made.
class CodeBlockLink {
  public:
    /// The most often that a transmission sends each code bit.
    static constexpr std::size_t maxRepetitions = 16;

    /// In which order coded bits pass the channel.
    enum class Order {
        /// That of the standard, which says what bits share a symbol.
        sent,
        /// That of the streams, where it does not matter: first all bits that are sent at least once, then
        /// all that are sent again. A transmission of all of them is one of the streams as they are.
        streams,
    };

    /// @param K        one of the 188 block sizes
    /// @param filler   F
    /// @param E        coded bits of a transmission
    /// @param rvs      the redundancy version of each transmission
    /// @throws std::invalid_argument for what RateMatching refuses, E of 0 or more than maxRepetitions times
    ///         the code bits, or a redundancy version that is not 0 to 3
    CodeBlockLink(std::uint32_t K, std::size_t filler, std::size_t E, std::span<const unsigned> rvs,
                  Order order);

    const Encoder& encoder() const { return itsEncoder; }
    const RateMatching& matching() const { return itsMatching; }
    std::size_t codedBits() const { return itsCodedBits; }

    /// The values of the three streams: 3 (K + 4).
    std::size_t softValues() const { return 3 * itsEncoder.positions(); }

    /// Where in the streams each coded bit of a transmission is, in the order in which they pass the channel.
    /// Bits that are sent again come in the same order as in the standard's.
    std::vector<std::uint16_t> places(std::size_t transmission) const;

    /// Select the coded bits of a transmission.
    /// @param codeBits  the streams of the encoder, of one block or of 8 together
    /// @param coded     receives codedBits() of the same form, in the order in which they pass the channel
    void select(std::size_t transmission, const std::uint8_t* codeBits, std::uint8_t* coded) const;

    /// Send coded bits and add what is received to the streams, each sum clipped to 8 bits.
    /// @param name      of the random numbers, but for the repetition; it has the transmission, from 0
    /// @param coded     as selected; of 8 blocks, this is number `lane`
    /// @param received  receives the codedBits() soft values, in the order in which they pass the channel
    /// @param soft      the streams of the core; what they hold before the first transmission does not matter
    void send(const Channel& channel, BlockName name, const std::uint8_t* coded, unsigned lane,
              std::int8_t* received, std::int8_t* soft) const;

  private:
    /// Coded bits that pass the channel together.
    struct Piece {
        std::vector<std::uint16_t> places;  ///< in the streams
        std::size_t run;                    ///< of the first ones: they lie after one another
        bool isOnce;                        ///< no bit comes twice
    };

    std::vector<Piece> piecesOf(unsigned rv, Order order) const;

    Encoder itsEncoder;
    RateMatching itsMatching;
    std::size_t itsCodedBits;
    std::vector<std::vector<Piece>> itsPieces;  ///< of each transmission
};

}  // namespace quarzel::link
