// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "link/coding/rate_matching.hpp"
#include "link/coding/rate_recovery.hpp"
#include "link/coding/segmentation.hpp"
#include "link/encoder.hpp"
#include "quarzel/core.hpp"

/// A transport block through the whole coding chain of 3GPP TS 36.212, sections 5.1.1 to 5.1.5, and back.
/// Bits are bytes of 0 or 1; soft values are positive for bit 1.
namespace quarzel::link {

/// One transmission of a transport block, in the standard's names.
struct Transmission {
    std::size_t G;        ///< coded bits
    unsigned Qm = 2;      ///< bits of a symbol
    unsigned layers = 1;  ///< N_L
    unsigned rv = 0;      ///< redundancy version, 0 to 3
};

/// What a receiver keeps of a transport block from one transmission to the next.
struct SoftBuffers {
    std::vector<std::int16_t> values;  ///< of all code blocks, in order; empty before the first transmission
    unsigned width = coreWidth;        ///< bits of a value, 2 to 16
};

/// The decisions on a transport block.
struct TransportDecisions {
    std::vector<std::uint8_t> bits;  ///< A decisions
    bool ok;                         ///< the CRC of the transport block holds
    std::vector<bool> blocksOk;      ///< for each code block: its CRC holds
};

/// The tables for transport blocks of one size, for callers that send or receive many.
///
/// Thread rule: it does not change once it is made.
class TransportBlockCode {
  public:
    /// @param A    bits of the transport block, without its CRC
    /// @param NIR  soft bits that the receiver has for it (see softBits); no limit without
    /// @throws std::invalid_argument when A is 0 or NIR leaves a code block without code bits
    explicit TransportBlockCode(std::size_t A, std::optional<std::size_t> NIR = std::nullopt);

    const Segmentation& segmentation() const { return itsSegmentation; }

    /// The rate matching of code block r.
    const RateMatching& matching(std::size_t r) const { return kindOf(r).matching; }

    /// The values of the soft buffers of all code blocks.
    std::size_t softValues() const { return itsSoftValues; }

    /// @param bits   A bits
    /// @param coded  receives G bits
    /// @throws std::invalid_argument when a size does not fit, a value is not 0 or 1, or there is no such
    ///         transmission
    void encode(std::span<const std::uint8_t> bits, const Transmission& transmission,
                std::span<std::uint8_t> coded) const;

    /// Add a transmission to the soft buffers.
    /// @param soft     G values
    /// @param buffers  receive the sums
    /// @return         the three streams of each code block as a core takes them, block after block
    /// @throws std::invalid_argument when a size does not fit or there is no such transmission
    std::vector<std::int8_t> combine(std::span<const std::int16_t> soft, const Transmission& transmission,
                                     SoftBuffers& buffers) const;

    /// Make a transport block of what a core has decided.
    /// @param decisions  on the bits of each code block, filler and CRC included, block after block
    /// @throws std::invalid_argument when a size does not fit
    TransportDecisions decide(std::span<const std::uint8_t> decisions) const;

    /// Add a transmission to the soft buffers and decode them.
    /// @param soft        G values
    /// @param iterations  of the core, for each code block
    /// @param buffers     receive the sums
    /// @throws std::invalid_argument when a size does not fit or there is no such transmission; Error when
    /// the
    ///         core refuses
    TransportDecisions decode(std::span<const std::int16_t> soft, const Transmission& transmission,
                              Core& core, int iterations, SoftBuffers& buffers) const;

  private:
    /// The tables for code blocks of one size and filler.
    struct Kind {
        Encoder encoder;
        RateMatching matching;
    };

    const Kind& kindOf(std::size_t r) const { return itsKinds[itsKindOfBlock[r]]; }

    std::size_t itsSize;  ///< A
    Segmentation itsSegmentation;
    std::vector<Kind> itsKinds;
    std::vector<std::size_t> itsKindOfBlock;
    std::size_t itsSoftValues = 0;
};

/// Encode one transport block.
/// @return  G bits
/// @throws as TransportBlockCode
std::vector<std::uint8_t> encodeTransportBlock(std::span<const std::uint8_t> bits,
                                               const Transmission& transmission,
                                               std::optional<std::size_t> NIR = std::nullopt);

/// Decode one transport block of A bits.
/// @throws as TransportBlockCode
TransportDecisions decodeTransportBlock(std::span<const std::int16_t> soft, std::size_t A,
                                        const Transmission& transmission, Core& core, int iterations,
                                        SoftBuffers& buffers, std::optional<std::size_t> NIR = std::nullopt);

}  // namespace quarzel::link
