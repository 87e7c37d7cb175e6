// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

#include "link/chain/code_block_link.hpp"
#include "link/coding/segmentation.hpp"

namespace quarzel::link {

/// What is sent and how, but for the noise.
struct LinkSetup {
    std::uint32_t blockSize = 0;       ///< K, for code blocks alone, which have no CRC; 0 otherwise
    std::uint32_t transportBlock = 0;  ///< A, for transport blocks; 0 otherwise
    std::size_t codedBits = 0;         ///< E or G, of a transmission; 0: each bit of code blocks alone once
    unsigned layers = 1;               ///< N_L, of a transport block
    std::vector<unsigned> redundancyVersions = {0};  ///< of each transmission
    ChannelSetup channel;
};

/// The coded bits, in whole symbols, that come nearest to a code rate. Rates so low that no link sends as
/// many give a number that CodedLink refuses.
/// @param rate  information bits for each coded bit, above 0
std::size_t codedBitsOfRate(std::size_t informationBits, double rate, unsigned bitsOfSymbol);

/// A link for code blocks or transport blocks, as tables: CRCs, segmentation, encoder and rate matching. Bits
/// are those of 8 blocks together: bit i of every byte belongs to block i.
///
/// Thread rule: it does not change once it is made.
class CodedLink {
  public:
    static constexpr std::size_t maxTransmissions = 32;
    static constexpr std::uint32_t maxTransportBlock = (1U << 19U) - 1;

    /// @throws std::invalid_argument when the sizes do not fit one another, there is not one of K and A, or
    ///         there are no transmissions or more than maxTransmissions; it names what would fit
    explicit CodedLink(const LinkSetup& setup);

    const LinkSetup& setup() const { return itsSetup; }

    /// K or A.
    std::size_t informationBits() const { return itsInformationBits; }

    /// What Eb/N0 counts: the information bits for each coded bit of one transmission; 1/3 when each code bit
    /// of a code block alone is sent once, its tail not counted.
    CodeRate rate() const { return itsRate; }

    const Segmentation& segmentation() const { return itsSegmentation; }
    bool hasCrc() const { return itsSetup.transportBlock != 0; }

    /// Code block r.
    const CodeBlockLink& codeBlock(std::size_t r) const { return itsKinds[itsKindOfBlock[r]]; }

    /// The values of the streams of the code blocks before number r; of all of them for r = C.
    std::size_t softValuesBefore(std::size_t r) const;

    /// The bits of the code blocks before number r.
    std::size_t bitsBefore(std::size_t r) const;

    /// @param bits      informationBits() of them
    /// @param blocks    receives the bits of all code blocks
    /// @param codeBits  receives the streams of all code blocks, softValuesBefore(C)
    void encode(std::span<const std::uint8_t> bits, std::span<std::uint8_t> blocks,
                std::span<std::uint8_t> codeBits) const;

  private:
    void makeCodeBlocks(const std::vector<std::size_t>& codedSizes);

    LinkSetup itsSetup;
    std::size_t itsInformationBits;
    Segmentation itsSegmentation;
    CodeRate itsRate;
    std::vector<CodeBlockLink> itsKinds;  ///< that differ in size, filler or coded bits
    std::vector<std::size_t> itsKindOfBlock;
};

}  // namespace quarzel::link
