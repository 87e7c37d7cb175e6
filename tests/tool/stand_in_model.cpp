// SPDX-License-Identifier: MIT
#include <chrono>
#include <new>
#include <thread>

#include "vardel_ip_quarzel.h"

namespace {

/// The first soft value of a block says what is to happen.
int simulate(const vardel_ip_quarzel_inputs& inputs) {
    switch (inputs.rsc1_sys[0]) {
        case -1:
            throw std::bad_alloc();
        case 1:
            std::this_thread::sleep_for(std::chrono::milliseconds(400));
            return 0;
        default:
            return inputs.rsc1_sys[0];
    }
}

}  // namespace

/// In the place of the library's function, so that the tool can be shown failures that no input brings about.
int vardel_ip_quarzel_bitacc_simulate_batch(vardel_ip_quarzel_state*, vardel_ip_quarzel_outputs*,
                                            const vardel_ip_quarzel_inputs* inputs, int count,
                                            int* statuses) {
    int result = 0;
    for (int i = 0; i < count; ++i) {
        statuses[i] = simulate(inputs[i]);
        result = result == 0 ? statuses[i] : result;
    }
    return result;
}
