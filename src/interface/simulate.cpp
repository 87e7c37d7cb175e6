// SPDX-License-Identifier: MIT
#include <algorithm>
#include <vector>

#include "decoder/decoder.hpp"
#include "interface/block_call.hpp"
#include "interface/messages.hpp"
#include "interface/overlap.hpp"
#include "interface/soft_input.hpp"

namespace quarzel {

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

void reportSaturation(vardel_ip_quarzel_state& state, const vardel_ip_quarzel_inputs& inputs) {
    if (state.saturation_reported != 0) {
        return;
    }
    if (const auto saturation = findSaturation(inputs, *state.input_format)) {
        warnSaturation(*saturation);
        state.saturation_reported = 1;
    }
}

namespace {

/// A negative size counts as boundless: the comparison is unsigned.
bool hasRoom(const vardel_ip_quarzel_outputs& outputs, std::size_t bits) {
    return static_cast<std::size_t>(outputs.dout_alloc_size) >= bits;
}

}  // namespace

bool takesLanes(vardel_ip_quarzel_state& state, const vardel_ip_quarzel_outputs& outputs,
                const vardel_ip_quarzel_inputs& inputs) {
    return inputs.din_size > 4 && hasRoom(outputs, blockSize(inputs)) &&
           state.decoder->takesLanes(blockSize(inputs));
}

bool truncates(const vardel_ip_quarzel_state& state, const vardel_ip_quarzel_inputs& inputs) {
    return (inputs.tag & state.tag_mask) != inputs.tag && state.tag_truncation_reported == 0;
}

void reportTruncation(vardel_ip_quarzel_state& state, const vardel_ip_quarzel_inputs& inputs) {
    if (truncates(state, inputs)) {
        warnTagTruncation(state.generics.C_TAG_WIDTH);
        state.tag_truncation_reported = 1;
    }
}

void fillRecord(const vardel_ip_quarzel_state& state, vardel_ip_quarzel_outputs& outputs,
                const vardel_ip_quarzel_inputs& inputs, std::size_t bits) {
    outputs.dout_size = static_cast<int>(bits);
    outputs.tag = inputs.tag & state.tag_mask;
}

namespace {

/// Decode a block by the literal road.
/// @return the status; the outputs are filled when it is 0
int decodeLiterally(vardel_ip_quarzel_state& state, vardel_ip_quarzel_outputs& outputs,
                    const vardel_ip_quarzel_inputs& inputs) {
    reportSaturation(state, inputs);
    std::vector<short> soft;
    toSoftValues(inputs, *state.input_format, *state.state_format, soft);
    std::vector<unsigned char> hard;
    if (!state.decoder->decode(soft, hard, static_cast<unsigned>(inputs.iterations))) {
        return 2;
    }
    if (!hasRoom(outputs, hard.size())) {
        decoderError("Insufficient allocated space for output array");
        return 1;
    }
    std::copy(hard.begin(), hard.end(), outputs.dout);
    fillRecord(state, outputs, inputs, hard.size());
    return 0;
}

/// Decode a block that the fast road takes. It finds out whether a value was saturated while it decodes; the
/// value is looked for when one was.
void decodeInLanes(vardel_ip_quarzel_state& state, vardel_ip_quarzel_outputs& outputs,
                   const vardel_ip_quarzel_inputs& inputs) {
    if (overwritesInputs(outputs, inputs)) {
        reportSaturation(state, inputs);
    }
    const LaneBlock block = laneBlock(outputs, inputs);
    if (state.decoder->decodeLanes(blockSize(inputs), static_cast<unsigned>(inputs.iterations),
                                   {&block, 1})) {
        reportSaturation(state, inputs);
    }
    fillRecord(state, outputs, inputs, blockSize(inputs));
}

/// Decode a block without a fault.
/// @return the status
int decode(vardel_ip_quarzel_state& state, vardel_ip_quarzel_outputs& outputs,
           const vardel_ip_quarzel_inputs& inputs) {
    try {
        if (takesLanes(state, outputs, inputs)) {
            decodeInLanes(state, outputs, inputs);
            return 0;
        }
        return decodeLiterally(state, outputs, inputs);
    } catch (...) {
        reportSaturation(state, inputs);
        return unhandledException();
    }
}

}  // namespace

}  // namespace quarzel

int vardel_ip_quarzel_bitacc_simulate(vardel_ip_quarzel_state* state, vardel_ip_quarzel_outputs* outputs,
                                      vardel_ip_quarzel_inputs inputs) {
    if (const char* fault = quarzel::findFault(state, outputs, inputs)) {
        quarzel::decoderError(fault);
        return 1;
    }
    const int status = quarzel::decode(*state, *outputs, inputs);
    if (status == 0) {
        quarzel::reportTruncation(*state, inputs);
    }
    return status;
}
