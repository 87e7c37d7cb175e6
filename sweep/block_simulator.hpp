// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <optional>
#include <utility>
#include <vector>

#include "link/chain/link_run.hpp"
#include "link/encoder.hpp"
#include "quarzel/core.hpp"
#include "sweep/channels.hpp"
#include "sweep/link_simulation.hpp"
#include "sweep/point_state.hpp"
#include "sweep/setup.hpp"

namespace quarzel::sweep {

/// Sends blocks through encoder, channel and core, and counts the errors.
///
/// Thread rule: one thread at a time; each thread has a simulator of its own.
class BlockSimulator {
  public:
    /// @param seed      of bits and noise
    /// @param channels  not owned, must outlive the simulator
    BlockSimulator(std::uint64_t seed, Channels& channels) : itsSeed(seed), itsChannels(channels) {}

    /// Simulate octets of blocks of a point.
    /// @param counts  how many times the errors of a block are counted: after every iteration of one
    ///                transmission, or after the last one of each
    /// @param octets  their numbers, ascending
    /// @return        the blocks in error; with a stop rule of the receiver all blocks
    /// @throws quarzel::Error when the library refuses
    ErrorList simulate(const Setup& setup, std::size_t counts, const std::vector<std::uint64_t>& octets);

    /// Make one block of a point again, by its number alone.
    /// @return  its code blocks, one unless it is a transport block, with what the core was given last
    /// @throws quarzel::Error when the library refuses
    std::vector<SentBlock> makeAgain(const Setup& setup, std::uint64_t number);

  private:
    Core& coreOf(const Setup& setup);
    link::LinkRun& runOf(const Setup& setup);
    const link::Encoder& encoderOf(std::uint32_t blockSize);
    void send(const Setup& setup, const std::vector<std::uint64_t>& octets);
    void decode(const Setup& setup, std::size_t counts, std::size_t blocks);
    ErrorList count(std::size_t K, std::size_t counts, const std::vector<std::uint64_t>& octets) const;

    std::uint64_t itsSeed;
    Channels& itsChannels;
    std::map<std::pair<int, int>, Core> itsCores;  ///< by units and algorithm
    std::map<std::uint32_t, link::Encoder> itsEncoders;
    const link::CodedLink* itsLink = nullptr;  ///< of the last point that was coded
    std::optional<link::LinkRun> itsRun;       ///< over it
    std::vector<std::uint8_t>
        itsBits;  ///< information bits: K bytes an octet, a bit of each byte for each block
    std::vector<std::uint8_t> itsCodeBits;
    std::vector<std::int8_t> itsSoft;         ///< three streams a block
    std::vector<unsigned char> itsDecisions;  ///< of each block K for each iteration that is counted
};

}  // namespace quarzel::sweep
