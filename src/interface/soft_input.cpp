// SPDX-License-Identifier: MIT
#include "interface/soft_input.hpp"

namespace quarzel {

std::optional<Saturation> toSoftValues(const vardel_ip_quarzel_inputs& inputs, const TNumberFormat& input,
                                       const TNumberFormat& state, std::vector<short>& soft) {
    const int* const streams[] = {inputs.rsc1_sys, inputs.rsc1_par, inputs.rsc2_par};
    std::optional<Saturation> first;
    soft.reserve(3 * static_cast<std::size_t>(inputs.din_size));
    for (int position = 0; position < inputs.din_size; ++position) {
        for (std::size_t stream = 0; stream < 3; ++stream) {
            int saturated = 0;
            soft.push_back(toSoftValue(streams[stream][position], input, state, saturated));
            if (saturated != 0 && !first) {
                first = Saturation{position, stream, saturated > 0};
            }
        }
    }
    return first;
}

}  // namespace quarzel
