// SPDX-License-Identifier: MIT
#include <algorithm>
#include <vector>

#include "decoder/decoder.hpp"
#include "interface/messages.hpp"
#include "interface/soft_input.hpp"
#include "interface/state.hpp"

using quarzel::decoderError;

namespace {

/// The text for the first argument that is wrong, or null.
const char* findFault(const vardel_ip_quarzel_state* state, const vardel_ip_quarzel_outputs* outputs,
                      const vardel_ip_quarzel_inputs& inputs) {
    if (state == nullptr) {
        return "Simulate called with null state structure";
    }
    if (outputs == nullptr) {
        return "Simulate called with null output structure";
    }
    if (outputs->dout == nullptr) {
        return "Simulate called with null pointer for dout";
    }
    if (inputs.din_size < 1) {
        return "din_size must be a positive integer";
    }
    if (inputs.rsc1_sys == nullptr) {
        return "rsc1_sys must not be a null pointer";
    }
    if (inputs.rsc1_par == nullptr) {
        return "rsc1_par must not be a null pointer";
    }
    if (inputs.rsc2_par == nullptr) {
        return "rsc2_par must not be a null pointer";
    }
    if (inputs.iterations < 1 || inputs.iterations > 15) {
        return "Number of iterations must be in the range 1 to 15";
    }
    return nullptr;
}

}  // namespace

int vardel_ip_quarzel_bitacc_simulate(vardel_ip_quarzel_state* state, vardel_ip_quarzel_outputs* outputs,
                                      vardel_ip_quarzel_inputs inputs) {
    if (const char* fault = findFault(state, outputs, inputs)) {
        decoderError(fault);
        return 1;
    }
    std::vector<short> soft;
    const auto saturation = quarzel::toSoftValues(inputs, *state->input_format, *state->state_format, soft);
    if (saturation && state->saturation_reported == 0) {
        quarzel::warnSaturation(*saturation);
        state->saturation_reported = 1;
    }

    std::vector<unsigned char> hard;
    try {
        if (!state->decoder->decode(soft, hard, static_cast<unsigned>(inputs.iterations))) {
            return 2;
        }
    } catch (...) {
        decoderError("Unhandled exception has occurred");
        return 99;
    }

    // A negative size counts as boundless: the comparison is unsigned.
    if (static_cast<std::size_t>(outputs->dout_alloc_size) < hard.size()) {
        decoderError("Insufficient allocated space for output array");
        return 1;
    }
    std::copy(hard.begin(), hard.end(), outputs->dout);
    outputs->dout_size = static_cast<int>(hard.size());
    outputs->tag = inputs.tag & state->tag_mask;
    if (outputs->tag != inputs.tag && state->tag_truncation_reported == 0) {
        quarzel::warnTagTruncation(state->generics.C_TAG_WIDTH);
        state->tag_truncation_reported = 1;
    }
    return 0;
}
