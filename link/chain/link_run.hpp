// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

#include "link/chain/coded_link.hpp"
#include "quarzel/core.hpp"

namespace quarzel::link {

/// What became of a block.
struct Verdict {
    std::uint32_t wrongBits;  ///< of its K or A information bits
    /// The receiver takes it: all its CRCs hold or, in a code block alone, no bit is wrong.
    bool isAccepted;
};

/// Octets of blocks on their way through a link: sent, decoded, judged, and those that wait for another
/// transmission sent again. Blocks are numbered from 0 among those that wait.
///
/// Thread rule: one thread at a time; each thread has a run of its own.
class LinkRun {
  public:
    /// @param link  not owned, must outlive the run
    LinkRun(const CodedLink& link, std::uint64_t seed) : itsLink(link), itsSeed(seed) {}

    /// Draw and encode new blocks, which all wait for their first transmission.
    /// @param octets  their numbers, ascending
    /// @param end     blocks from this number on are left out
    void begin(Decibels ebN0, std::span<const std::uint64_t> octets, std::uint64_t end);

    /// Send the blocks that wait.
    /// @param channel       of the same Eb/N0
    /// @param transmission  from 0, one after another
    void transmit(const Channel& channel, std::uint32_t transmission);

    /// The blocks that wait.
    std::size_t size() const { return itsBlocks.size(); }

    /// The number of one of them at its point.
    std::uint64_t number(std::size_t i) const { return itsBlocks[i]; }

    /// Decode the blocks that wait.
    /// @param everyIteration  keep the decisions after each iteration, not only after the last one
    /// @throws quarzel::Error when the core refuses
    void decode(Core& core, int iterations, bool everyIteration);

    /// Judge a decoded block.
    /// @param count  from 0: after which of the iterations whose decisions are kept
    Verdict verdict(std::size_t i, std::size_t count);

    /// Keep the blocks that are to be sent again.
    /// @param isWaiting  an entry for each block: not 0 to keep it
    void retain(std::span<const std::uint8_t> isWaiting);

    /// The three streams of a code block as the core is given them.
    std::span<const std::int8_t> soft(std::size_t i, std::size_t r) const;

    /// The bits of all code blocks of a block's octet, and which of each byte is the block's.
    std::span<const std::uint8_t> bits(std::size_t i) const;
    unsigned lane(std::size_t i) const { return static_cast<unsigned>(itsBlocks[i] % blocksPerOctet); }

  private:
    BlockName nameOf(std::uint64_t block) const;
    std::size_t octetOf(std::size_t i) const;
    std::size_t softPlace(std::size_t i, std::size_t r) const;
    const std::uint8_t* decisions(std::size_t i, std::size_t r, std::size_t count) const;
    bool crcsHold(std::size_t i, std::size_t count);

    const CodedLink& itsLink;
    std::uint64_t itsSeed;
    Decibels itsEbN0;
    std::vector<std::uint64_t> itsOctets;
    std::vector<std::uint8_t> itsBits;       ///< of the code blocks of each octet
    std::vector<std::uint8_t> itsCodeBits;   ///< the same encoded
    std::vector<std::uint64_t> itsBlocks;    ///< numbers of those that wait, ascending
    std::vector<std::int8_t> itsSoft;        ///< of code block 0 of each block, then 1, and so on
    std::size_t itsCounts = 1;               ///< iterations whose decisions are kept
    std::vector<std::uint8_t> itsDecisions;  ///< ordered like itsSoft; of each code block all counts
    std::vector<std::uint8_t> itsJoined;     ///< the decisions of a block whose CRCs are looked at
    std::vector<std::uint8_t> itsCoded;      ///< of the octet that is being sent
    std::vector<std::int8_t> itsReceived;    ///< of one of its code blocks
};

}  // namespace quarzel::link
