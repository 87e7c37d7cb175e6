// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>

#include "link/channel_thresholds.hpp"
#include "link/draw/draw.hpp"

namespace quarzel::link {

/// Make the table of a search: the likeliest outputs that follow one another. Random numbers of others, of
/// cells with many thresholds and those in which a threshold lies are undecided. Pure.
/// @param cells  of the look-up of the same channel
SearchTable makeSearchTable(const ChannelThresholds& thresholds,
                            const std::array<std::int32_t, cellCount>& cells);

}  // namespace quarzel::link
