// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <vector>

#include "link/chain/coded_link.hpp"

namespace quarzel::tool {

/// A transmission of a block at each stage of a link. What belongs to code blocks is stored code block after
/// code block.
struct TransmissionStages {
    std::vector<std::uint8_t> coded;      ///< after rate matching
    std::vector<std::int8_t> symbols;     ///< I and Q of each, in units in which the least amplitude is 1
    std::vector<std::int8_t> received;    ///< soft values of the coded bits
    std::vector<std::int8_t> softBuffer;  ///< after it, entries of w: 0 at dummies and filler bits
    std::vector<std::int8_t> streams;     ///< the same as the core takes them, 3 (K + 4) for each code block
};

/// A transport block, or a code block alone, at each stage of a link. Bits are 0, 1, or link::nullBit for
/// <NULL>.
struct LinkStages {
    std::vector<std::uint8_t> bits;        ///< A or K
    std::vector<std::uint8_t> withCrc;     ///< a transport block with its CRC; empty for a code block alone
    std::vector<std::uint8_t> codeBlocks;  ///< with filler and CRCs
    std::vector<std::uint8_t> streams;     ///< of the encoder, 3 (K + 4) for each code block
    std::vector<std::uint8_t> subBlocks;   ///< the same interleaved, with dummies
    std::vector<std::uint8_t> buffer;      ///< w
    std::vector<TransmissionStages> transmissions;
};

/// Makes the stages of blocks: the same blocks and the same noise that a sweep of this link has.
///
/// Thread rule: `make` may be called from several threads at once.
class LinkStageSource {
  public:
    /// @param link  not owned, must outlive the source
    LinkStageSource(const link::CodedLink& link, link::Decibels ebN0, std::uint64_t seed);

    /// The stages of a block, for all transmissions.
    /// @param block  its number, from 0
    LinkStages make(std::uint32_t block) const;

  private:
    void encode(LinkStages& stages) const;
    TransmissionStages transmit(const LinkStages& stages, link::BlockName name,
                                std::span<const std::int8_t> earlier) const;

    const link::CodedLink& itsLink;
    link::Decibels itsEbN0;
    std::uint64_t itsSeed;
    std::unique_ptr<const link::Channel> itsChannel;
};

}  // namespace quarzel::tool
