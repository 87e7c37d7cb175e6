// SPDX-License-Identifier: MIT
#include <chrono>
#include <new>
#include <thread>

#include "vardel_ip_quarzel.h"

/// In the place of the library's function: the first soft value of a block says what is to happen, so that
/// the tool can be shown failures that no input brings about.
int vardel_ip_quarzel_bitacc_simulate(vardel_ip_quarzel_state*, vardel_ip_quarzel_outputs*,
                                      vardel_ip_quarzel_inputs inputs) {
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
