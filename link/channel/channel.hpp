// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>

#include "link/channel_thresholds.hpp"
#include "link/modulation/demodulation.hpp"
#include "link/random_source.hpp"

namespace quarzel::link {

/// The way from coded bits to the soft values of a core: modulation, noise, soft demapping and quantiser.
///
/// Thread rule: `transmit` may be called from several threads at once.
class Channel {
  public:
    Channel() = default;
    Channel(const Channel&) = delete;
    Channel& operator=(const Channel&) = delete;
    virtual ~Channel() = default;

    /// Send coded bits.
    /// @param source     the random numbers of the code block in this transmission
    /// @param codedBits  a byte for each bit, which is bit `lane` of the byte
    /// @param count      coded bits of whole symbols, at most 2^19
    /// @param soft       receives `count` soft values; positive means bit 1
    virtual void transmit(const RandomSource& source, const std::uint8_t* codedBits, unsigned lane,
                          std::size_t count, std::int8_t* soft) const = 0;

    /// Send the coded bits of all blocks of an octet.
    /// @param source     the random numbers of any of them
    /// @param codedBits  bit i of each byte is of block i
    /// @param soft       receives `count` soft values for each block: those that `transmit` gives
    virtual void transmitOctet(const RandomSource& source, const std::uint8_t* codedBits, std::size_t count,
                               std::int8_t* soft) const;
};

/// How the amplitude of the received symbols varies, which the receiver knows: not at all, or as Rayleigh's
/// distribution with a mean square of 1, independently for each symbol or for each transmission of a block.
enum class Fading { none, perSymbol, perBlock };

/// The names of the channels with each of them.
inline constexpr std::array<std::string_view, 3> channelNames = {"awgn", "rayleigh", "rayleigh-block"};

/// The fading of a channel's name.
/// @throws std::invalid_argument listing the names when it is none of them
Fading fadingOf(std::string_view name);

/// A channel without its Eb/N0.
struct ChannelSetup {
    Modulation modulation = Modulation::qpsk;
    Fading fading = Fading::none;
    Demapping demapping = Demapping::maxLog;
    /// The log-likelihood ratio is scaled as the quantiser says. With `amplitude` it is taken in units in
    /// which it is the received value of BPSK: times sigma^2 / 2, where sigma^2 is the variance of the noise
    /// of a component at a least amplitude of 1.
    Quantiser quantiser;

    bool operator==(const ChannelSetup&) const = default;
};

/// Whether every soft value depends on its own bit alone, so that the order of the bits does not matter.
bool isMemoryless(const ChannelSetup& setup);

/// Make a channel with its tables.
/// @param rate  information bits for each coded bit, which Eb/N0 counts
std::unique_ptr<const Channel> makeChannel(const ChannelSetup& setup, Decibels ebN0, CodeRate rate);

}  // namespace quarzel::link
