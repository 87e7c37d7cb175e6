// SPDX-License-Identifier: MIT
#include "interface/block_call.hpp"

int vardel_ip_quarzel_bitacc_simulate(vardel_ip_quarzel_state* state, vardel_ip_quarzel_outputs* outputs,
                                      vardel_ip_quarzel_inputs inputs) {
    if (state == nullptr) {
        quarzel::decoderError(quarzel::standardStreams, "Simulate called with null state structure");
        return 1;
    }
    if (outputs == nullptr) {
        quarzel::decoderError(state->messages, "Simulate called with null output structure");
        return 1;
    }
    return quarzel::simulateBlock(*state, quarzel::RecordSource(outputs, &inputs), 0);
}
