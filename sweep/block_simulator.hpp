// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

#include "link/encoder.hpp"
#include "link/quantised_channel.hpp"
#include "quarzel/core.hpp"
#include "sweep/configuration.hpp"
#include "sweep/point_state.hpp"

namespace quarzel::sweep {

/// The channels of a sweep, each made when it is first needed.
///
/// Thread rule: `at` may be called from several threads at once.
class Channels {
  public:
    explicit Channels(const link::Quantiser& quantiser) : itsQuantiser(quantiser) {}

    std::shared_ptr<const link::QuantisedChannel> at(link::Decibels ebN0);

  private:
    link::Quantiser itsQuantiser;
    std::mutex itsMutex;
    std::map<link::Decibels, std::shared_ptr<const link::QuantisedChannel>> itsChannels;
};

/// Sends blocks through encoder, channel and core, and counts the errors.
///
/// Thread rule: one thread at a time; each thread has a simulator of its own.
class BlockSimulator {
  public:
    /// @param channels  not owned, must outlive the simulator
    BlockSimulator(const Configuration& configuration, Channels& channels)
        : itsConfiguration(configuration), itsChannels(channels) {}

    /// Simulate octets of blocks of a point.
    /// @param octets  their numbers, ascending
    /// @return        the blocks in error
    /// @throws quarzel::Error when the library refuses
    ErrorList simulate(const Curve& curve, link::Decibels ebN0, const std::vector<std::uint64_t>& octets);

  private:
    Core& coreOf(const Curve& curve);
    const link::Encoder& encoderOf(std::uint32_t blockSize);
    void send(const Curve& curve, link::Decibels ebN0, const std::vector<std::uint64_t>& octets);
    void decode(const Curve& curve);
    ErrorList count(const Curve& curve) const;

    const Configuration& itsConfiguration;
    Channels& itsChannels;
    std::map<std::pair<int, int>, Core> itsCores;  ///< by units and algorithm
    std::map<std::uint32_t, link::Encoder> itsEncoders;
    std::vector<std::uint64_t> itsBlocks;  ///< numbers of the blocks that are being simulated
    std::vector<std::uint8_t>
        itsBits;  ///< information bits: K bytes an octet, a bit of each byte for each block
    std::vector<std::uint8_t> itsCodeBits;
    std::vector<std::int8_t> itsSoft;         ///< three streams a block
    std::vector<unsigned char> itsDecisions;  ///< of each block K for each iteration that is counted
};

}  // namespace quarzel::sweep
