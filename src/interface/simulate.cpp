// SPDX-License-Identifier: MIT
#include "interface/block_call.hpp"

int vardel_ip_quarzel_bitacc_simulate(vardel_ip_quarzel_state* state, vardel_ip_quarzel_outputs* outputs,
                                      vardel_ip_quarzel_inputs inputs) {
    if (state == nullptr) {
        return quarzel::refuse(quarzel::standardStreams, "Simulate called with null state structure");
    }
    if (outputs == nullptr) {
        return quarzel::refuse(state->messages, "Simulate called with null output structure");
    }
    return quarzel::simulateBlock(*state, quarzel::RecordSource(outputs, &inputs), 0);
}
