// SPDX-License-Identifier: MIT
#include "interface/grouped_calls.hpp"

int vardel_ip_quarzel_bitacc_simulate_batch(vardel_ip_quarzel_state* state,
                                            vardel_ip_quarzel_outputs* outputs,
                                            const vardel_ip_quarzel_inputs* inputs, int count,
                                            int* statuses) {
    using quarzel::refuse;
    if (state == nullptr) {
        return refuse(quarzel::standardStreams, "Simulate batch called with null state structure");
    }
    if (count < 0) {
        return refuse(state->messages, "count must not be negative");
    }
    if (count == 0) {
        return 0;
    }
    if (outputs == nullptr) {
        return refuse(state->messages, "Simulate batch called with null output structures");
    }
    if (inputs == nullptr) {
        return refuse(state->messages, "Simulate batch called with null input structures");
    }
    return quarzel::simulateAll(*state, quarzel::RecordSource(outputs, inputs), count, statuses);
}
