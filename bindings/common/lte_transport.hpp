// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

#include "host_core.hpp"
#include "link/coding/transport_block.hpp"
#include "rows.hpp"

/// Transport blocks in arrays of a host, through the whole coding chain and back.
namespace quarzel::bindings {

/// @param coded  receives G bits for each array of A bits
/// @throws BindingError or std::invalid_argument for what does not fit
void encodeTransportBlocks(const link::TransportBlockCode& code, const link::Transmission& transmission,
                           Rows<const std::uint8_t> bits, Rows<std::uint8_t> coded);

/// What receiving transport blocks fills.
struct TransportResults {
    Rows<std::int16_t> buffers;  ///< `softValues` for each, to which the transmission is added
    Rows<std::uint8_t> bits;     ///< A for each
    Rows<std::uint8_t> ok;       ///< 1 for each: whether its CRC holds
};

/// Decode transport blocks. The code blocks of many are decoded together, which fills the lanes of the core.
/// @param soft  G values for each
/// @throws BindingError or std::invalid_argument for what does not fit, or when the user has asked to stop
void decodeTransportBlocks(const link::TransportBlockCode& code, const link::Transmission& transmission,
                           Rows<const std::int16_t> soft, HostCore& core, int iterations,
                           const TransportResults& results, const HostCore::Interrupted& interrupted);

}  // namespace quarzel::bindings
