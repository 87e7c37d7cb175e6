// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "link/decibels.hpp"
#include "link/draw/draw.hpp"

namespace quarzel::link {

/// Blocks are encoded by octets, 8 from a multiple of 8 on, a bit of each byte for each.
constexpr std::uint64_t blocksPerOctet = 8;

/// The name of the random numbers of a code block in a transmission. Equal names give equal numbers on every
/// machine, different names independent ones. The core, the quantiser and the modulation are not part of it,
/// so they are compared on the same bits and the same noise.
struct BlockName {
    std::uint64_t seed;
    std::uint32_t blockSize;  ///< K; of no meaning in a transport block
    Decibels ebN0;            ///< within 67 dB of 0
    std::uint64_t block;      ///< number of the block at its point, below 2^40

    std::uint32_t transmission = 0;    ///< below 32; the first one has the information bits
    std::uint32_t repetition = 0;      ///< below 32: how often the code bits were sent in it before
    std::uint32_t transportBlock = 0;  ///< A, below 2^19; 0 for code blocks alone
    std::uint32_t codeBlock = 0;       ///< number in the transport block, below 1024
};

/// The purpose of random numbers. Numbers for different purposes are independent.
enum class Purpose : std::uint32_t {
    informationBits = 0,
    noise = 1,
    refinement = 2,  ///< further bits of noise where the first ones do not decide
    fading = 3,
    fadingRefinement = 4,
};

/// Random words of the blocks of an octet.
class OctetWords {
  public:
    OctetWords(const PhiloxInput& first, std::size_t count);

    /// Those of the block at a place in the octet. Where more than 16 were drawn, they follow one another.
    const std::uint32_t* of(unsigned lane) const {
        const std::size_t counter = std::size_t{lane} << itsShift;
        return &itsWords[counter / countersPerGroup * wordsPerGroup + counter % countersPerGroup];
    }

  private:
    unsigned itsShift;  ///< of the counters that are drawn of a block, a power of 2
    std::array<std::uint32_t, blocksPerOctet * wordsPerGroup> itsWords;
};

/// The random numbers of one code block, from the counter-based generator Philox4x32-10. The key is the seed;
/// the counter is made of the name, the purpose and the index, each in bits of its own.
///
/// Thread rule: all functions may be called from several threads at once.
class RandomSource {
  public:
    explicit RandomSource(const BlockName& name);

    std::uint32_t blockSize() const { return itsName.blockSize; }

    /// The block's place in its octet.
    unsigned lane() const { return static_cast<unsigned>(itsName.block % blocksPerOctet); }

    /// The numbers of the block at a place in the same octet.
    RandomSource ofLane(unsigned lane) const;

    /// The numbers that all code blocks of a transport block share in a transmission: those of its first.
    RandomSource ofTransmission() const;

    /// Draw random words, in groups of wordsPerGroup.
    /// @param firstGroup  number of the first group, from 0
    /// @param words       receives groups * wordsPerGroup words
    void words(Purpose purpose, std::uint32_t firstGroup, std::size_t groups, std::uint32_t* words) const;

    /// Draw words of all blocks of the octet, together where a block needs only few.
    /// @param firstGroup  as of `words`; what is drawn are the first words of this group
    /// @param count       of them for each block, at most 64
    OctetWords octetWords(Purpose purpose, std::uint32_t firstGroup, std::size_t count) const;

    /// Draw the information bits of all blocks of the octet.
    /// @param bits  receives K bytes, or A and up to the next multiple of 8: bit i of each is of block i
    void octetBits(std::uint8_t* bits) const;

    /// Draw the information bits.
    /// @param bits  receives as many bytes as octetBits, of 0 or 1
    void informationBits(std::uint8_t* bits) const;

  private:
    std::uint32_t informationBitCount() const {
        return itsName.transportBlock != 0 ? itsName.transportBlock : itsName.blockSize;
    }

    PhiloxInput input(Purpose purpose, std::uint32_t index) const;

    BlockName itsName;
    PhiloxInput itsInput;
};

}  // namespace quarzel::link
