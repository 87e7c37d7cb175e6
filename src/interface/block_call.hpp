// SPDX-License-Identifier: MIT
#pragma once

#include "decoder/lane_decode.hpp"
#include "interface/state.hpp"

/// The parts of one call of simulate, in their order.
namespace quarzel {

/// The text for the first argument that is wrong, or null.
const char* findFault(const vardel_ip_quarzel_state* state, const vardel_ip_quarzel_outputs* outputs,
                      const vardel_ip_quarzel_inputs& inputs);

/// Warn of the first saturated value in the life of a state.
void reportSaturation(vardel_ip_quarzel_state& state, const vardel_ip_quarzel_inputs& inputs);

/// Whether the fast road takes a block of this length, with room for its decisions.
bool takesLanes(vardel_ip_quarzel_state& state, const vardel_ip_quarzel_outputs& outputs,
                const vardel_ip_quarzel_inputs& inputs);

/// Information bits of a block that the fast road takes.
inline unsigned blockSize(const vardel_ip_quarzel_inputs& inputs) {
    return static_cast<unsigned>(inputs.din_size) - 4;
}

inline LaneBlock laneBlock(const vardel_ip_quarzel_outputs& outputs, const vardel_ip_quarzel_inputs& inputs) {
    return {{inputs.rsc1_sys, inputs.rsc1_par, inputs.rsc2_par}, outputs.dout};
}

/// Whether this tag is the first truncated one in the life of a state.
bool truncates(const vardel_ip_quarzel_state& state, const vardel_ip_quarzel_inputs& inputs);

/// Warn of the first truncated tag in the life of a state.
void reportTruncation(vardel_ip_quarzel_state& state, const vardel_ip_quarzel_inputs& inputs);

/// Fill the record of a decoded block.
void fillRecord(const vardel_ip_quarzel_state& state, vardel_ip_quarzel_outputs& outputs,
                const vardel_ip_quarzel_inputs& inputs, std::size_t bits);

}  // namespace quarzel
