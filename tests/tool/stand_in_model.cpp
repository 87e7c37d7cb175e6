// SPDX-License-Identifier: MIT
#include <chrono>
#include <new>
#include <thread>

#include "vardel_ip_quarzel.h"

namespace {

/// Let the model refuse a block, so that it says something.
void refuse(vardel_ip_quarzel_state* state) {
    const int value = 0;
    unsigned char bit = 0;
    vardel_ip_quarzel_outputs outputs{&bit, 1, 0, 0};
    vardel_ip_quarzel_bitacc_simulate(state, &outputs, {&value, &value, &value, 1, 0, 0});
}

/// The first soft value of a block says what is to happen.
int simulate(vardel_ip_quarzel_state* state, int request) {
    switch (request) {
        case -1:
            throw std::bad_alloc();
        case 1:
            std::this_thread::sleep_for(std::chrono::milliseconds(400));
            return 0;
        case 0:
            return 0;
        default:
            refuse(state);
            return request;
    }
}

}  // namespace

/// In the place of the library's function, so that the tool can be shown failures that no input brings about.
int vardel_ip_quarzel_bitacc_simulate_array(vardel_ip_quarzel_state* state,
                                            const vardel_ip_quarzel_array_outputs*,
                                            const vardel_ip_quarzel_array_inputs* inputs, int* statuses) {
    int result = 0;
    for (int i = 0; i < inputs->count; ++i) {
        statuses[i] = simulate(state, static_cast<const int*>(inputs->rsc1_sys)[i * inputs->block_stride]);
        result = result == 0 ? statuses[i] : result;
    }
    return result;
}
