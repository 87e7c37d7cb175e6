// SPDX-License-Identifier: MIT
#include "interface/soft_input.hpp"

namespace quarzel {

void toSoftValues(const vardel_ip_quarzel_inputs& inputs, const TNumberFormat& input,
                  const TNumberFormat& state, std::vector<short>& soft) {
    const int* const streams[] = {inputs.rsc1_sys, inputs.rsc1_par, inputs.rsc2_par};
    soft.reserve(3 * static_cast<std::size_t>(inputs.din_size));
    for (int position = 0; position < inputs.din_size; ++position) {
        for (const int* stream : streams) {
            int saturated = 0;
            soft.push_back(toSoftValue(stream[position], input, state, saturated));
        }
    }
}

std::optional<Saturation> findSaturation(const vardel_ip_quarzel_inputs& inputs, const TNumberFormat& input) {
    const int* const streams[] = {inputs.rsc1_sys, inputs.rsc1_par, inputs.rsc2_par};
    for (int position = 0; position < inputs.din_size; ++position) {
        for (std::size_t stream = 0; stream < 3; ++stream) {
            int saturated = 0;
            toSoftValue(streams[stream][position], input, input, saturated);
            if (saturated != 0) {
                return Saturation{position, stream, saturated > 0};
            }
        }
    }
    return std::nullopt;
}

}  // namespace quarzel
