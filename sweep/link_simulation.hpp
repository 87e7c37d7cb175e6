// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

#include "link/chain/link_run.hpp"
#include "quarzel/core.hpp"
#include "sweep/point_state.hpp"
#include "sweep/setup.hpp"

namespace quarzel::sweep {

/// Send octets of blocks through a coded link, each until it is accepted or has had all its transmissions.
/// @param counts  how many times the errors of a block are counted: after each transmission, or after each
///                iteration of the only one
/// @param run     of the setup's link, at any state
/// @param octets  their numbers, ascending
/// @return        the blocks in error; with a stop rule of the receiver all blocks
/// @throws quarzel::Error when the library refuses
ErrorList simulateLink(const Setup& setup, std::size_t counts, link::LinkRun& run,
                       const link::Channel& channel, Core& core, const std::vector<std::uint64_t>& octets);

/// The bits of one of 8 blocks, a byte for each.
std::vector<std::uint8_t> bitsOfLane(std::span<const std::uint8_t> bits, unsigned lane);

/// A code block on its way.
struct SentBlock {
    std::vector<std::uint8_t> bits;  ///< K, as they were sent
    std::vector<std::int8_t> soft;   ///< the three streams, as the core was given them
};

/// Send one block again, until it is accepted or has had all its transmissions.
/// @param link    the setup's
/// @param run     of it, at any state
/// @param number  of the block at its point
/// @return        its code blocks, with what the core was given last
std::vector<SentBlock> sendOverLink(const Setup& setup, const link::CodedLink& link, link::LinkRun& run,
                                    const link::Channel& channel, Core& core, std::uint64_t number);

}  // namespace quarzel::sweep
