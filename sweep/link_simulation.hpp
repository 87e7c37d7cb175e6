// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
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

}  // namespace quarzel::sweep
