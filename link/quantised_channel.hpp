// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "link/channel/channel.hpp"
#include "link/channel_thresholds.hpp"
#include "link/random_source.hpp"
#include "link/refinement.hpp"

namespace quarzel::link {

/// BPSK (bit 1 is sent as +1, bit 0 as -1) or a component of QPSK over additive white Gaussian noise,
/// quantised to the 8-bit inputs of the core, as one discrete channel: its output is drawn from the exact
/// distribution, to 2^-48, by a search in registers or a table look-up.
///
/// Thread rule: `transmit` may be called from several threads at once.
class QuantisedChannel : public Channel {
  public:
    /// @param draw  not owned, must outlive the channel; all give the same outputs
    QuantisedChannel(const Quantiser& quantiser, Decibels ebN0, CodeRate rate = {},
                     const DrawFunctions& draw = drawFunctions());

    /// Send the code bits of a block.
    /// @param source    the block's random numbers; value i depends on them and on code bit i alone
    /// @param codeBits  a byte for each code bit, which is bit `lane` of the byte
    /// @param count     code bits, at most 3 (6144 + 4)
    /// @param soft      receives `count` soft values; positive means bit 1
    void transmit(const RandomSource& source, const std::uint8_t* codeBits, unsigned lane, std::size_t count,
                  std::int8_t* soft) const override;

    void transmitOctet(const RandomSource& source, const std::uint8_t* codeBits, std::size_t count,
                       std::int8_t* soft) const override;

    /// The probability of a soft value given the code bit, as `transmit` draws it.
    double probability(int soft, bool codeBit) const;

  private:
    int outputOf(std::uint64_t random) const;
    void makeCells();
    class LastValues;
    void draw(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane, std::size_t count,
              std::int8_t* soft, std::uint32_t* undecided) const;
    void receive(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane, std::size_t count,
                 std::int8_t* soft, Refinement& refinement) const;
    void send(const RandomSource& source, const std::uint8_t* codeBits, unsigned lane, std::size_t start,
              std::size_t end, std::int8_t* soft, Refinement& refinement) const;
    std::int8_t decide(std::uint32_t random, bool codeBit, Refinement& refinement) const;

    const DrawFunctions& itsDraw;
    ChannelThresholds itsThresholds;
    std::array<std::int32_t, cellCount> itsCells{};
    SearchTable itsSearch;
};

}  // namespace quarzel::link
