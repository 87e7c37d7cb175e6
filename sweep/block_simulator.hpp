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
#include "sweep/configuration.hpp"
#include "sweep/point_state.hpp"
#include "vardel_ip_quarzel.h"

namespace quarzel::sweep {

/// The channels of a sweep, made when they are needed.
///
/// Thread rule: for several threads at once.
class Channels {
  public:
    explicit Channels(const link::Quantiser& quantiser) : itsQuantiser(quantiser) {}

    std::shared_ptr<const link::QuantisedChannel> at(link::Decibels ebN0);

  private:
    link::Quantiser itsQuantiser;
    std::mutex itsMutex;
    std::map<link::Decibels, std::shared_ptr<const link::QuantisedChannel>> itsChannels;
};

/// Sends blocks through encoder, channel and core and counts the errors.
///
/// Thread rule: one thread at a time; each thread has a simulator of its own.
class BlockSimulator {
  public:
    /// @param channels  not owned, must outlive the simulator
    BlockSimulator(const Configuration& configuration, Channels& channels)
        : itsConfiguration(configuration), itsChannels(channels) {}

    /// Simulate groups of blocks of a point.
    /// @param groups   numbers of the groups, ascending
    /// @return         the blocks in error
    /// @throws std::runtime_error when the library refuses; it has said why
    ErrorList simulate(const Curve& curve, link::Decibels ebN0, const std::vector<std::uint64_t>& groups);

  private:
    struct DestroyState {
        void operator()(vardel_ip_quarzel_state* state) const { vardel_ip_quarzel_destroy_state(state); }
    };
    using Core = std::unique_ptr<vardel_ip_quarzel_state, DestroyState>;

    vardel_ip_quarzel_state* coreOf(const Curve& curve);
    const link::Encoder& encoderOf(std::uint32_t blockSize);
    void send(const Curve& curve, link::Decibels ebN0, const std::vector<std::uint64_t>& groups);
    void decode(const Curve& curve, int iterations);
    void count(std::uint32_t blockSize, std::size_t counts, std::size_t column);

    const Configuration& itsConfiguration;
    Channels& itsChannels;
    std::map<std::pair<int, int>, Core> itsCores;  ///< by units and algorithm
    std::map<std::uint32_t, link::Encoder> itsEncoders;
    std::vector<std::uint64_t> itsBlocks;  ///< numbers of the blocks at work
    std::vector<std::uint8_t> itsBits;     ///< information bits, K bytes a group, a bit a block
    std::vector<std::uint8_t> itsCodeBits;
    std::vector<int> itsSoft;
    std::vector<unsigned char> itsDecisions;
    std::vector<vardel_ip_quarzel_inputs> itsInputs;
    std::vector<vardel_ip_quarzel_outputs> itsOutputs;
    std::vector<std::uint32_t> itsErrors;  ///< bit errors, a row for each block
};

}  // namespace quarzel::sweep
