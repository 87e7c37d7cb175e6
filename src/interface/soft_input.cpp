// SPDX-License-Identifier: MIT
#include "interface/soft_input.hpp"

#include <algorithm>

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

namespace {

/// Whether every value lies in the range of the input format: a plain loop that compilers turn into vectors.
bool allInRange(const int* values, int count, const TNumberFormat& input) {
    const auto offset = static_cast<unsigned>(-input.minQ);
    unsigned seen = 0;
    for (int i = 0; i < count; ++i) {
        seen |= static_cast<unsigned>(values[i]) + offset;
    }
    return seen <= static_cast<unsigned>(input.maxQ) + offset;
}

}  // namespace

std::optional<Saturation> findSaturation(const vardel_ip_quarzel_inputs& inputs, const TNumberFormat& input) {
    const int* const streams[] = {inputs.rsc1_sys, inputs.rsc1_par, inputs.rsc2_par};
    if (std::all_of(std::begin(streams), std::end(streams),
                    [&](const int* stream) { return allInRange(stream, inputs.din_size, input); })) {
        return std::nullopt;
    }
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
