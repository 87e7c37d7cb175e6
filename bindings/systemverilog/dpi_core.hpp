// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>
#include <deque>
#include <memory>
#include <string>
#include <vector>

#include "common/host_core.hpp"

namespace quarzel::dpi {

/// A model as a simulation uses it, with what the simulation pushes into it and has not popped yet.
struct DpiCore {
    bindings::HostCore core;
    std::vector<std::array<std::int32_t, 3>> soft;  ///< pushed positions of the next block
    std::vector<std::uint8_t> bits;                 ///< decisions of the last block
    std::size_t popped = 0;                         ///< how many of them have been popped
    std::vector<std::uint8_t> information;          ///< pushed bits of the next block to encode
    std::vector<std::uint8_t> code;                 ///< code bits of the last encoded block, stream by stream
    std::uint32_t tag = 0;                          ///< of the last decoded block
    std::uint32_t tracePasses = 0;                  ///< to trace of the next block
    std::string traceFile;
    std::deque<std::string> warnings;  ///< not handed over yet
    std::string warning;               ///< handed over last
    std::string error;                 ///< of the last call; empty when it was good

    /// With room for the error that memory has run out.
    DpiCore() { error.reserve(100); }

    /// Keep what a call says.
    /// @return whether it was good
    bool take(bindings::Outcome&& outcome);
};

/// The handle of a new core; never null. Handles are numbers that are used once, so that one that was closed
/// or came from another process is known as such for ever.
void* addCore();

/// The core of a handle, or null when there is none.
std::shared_ptr<DpiCore> findCore(void* handle);

/// Forget a handle.
void removeCore(void* handle);

}  // namespace quarzel::dpi
