// SPDX-License-Identifier: MIT
#include <cstddef>
#include <cstdlib>
#include <new>
#include <string>

#include "decoder/decoder_3gpu.hpp"
#include "engine/engine.hpp"
#include "fixed/number_format.hpp"
#include "interface/block_call.hpp"
#include "interface/lane_implementation.hpp"
#include "interface/pass_port.hpp"
#include "interface/wiring.hpp"
#include "interleaver/interleaver.hpp"

using quarzel::decoderError;
using quarzel::Messages;

// The layout of the records on 64-bit Linux, for every compiler and language.
static_assert(sizeof(void*) != 8 || sizeof(vardel_ip_quarzel_generics) == 72);
static_assert(sizeof(void*) != 8 || sizeof(vardel_ip_quarzel_inputs) == 40);
static_assert(sizeof(void*) != 8 || sizeof(vardel_ip_quarzel_outputs) == 24);

vardel_ip_quarzel_generics* vardel_ip_quarzel_get_default_generics(vardel_ip_quarzel_generics* generics) {
    *generics = {
        .C_PATH = "./",
        .C_FAMILY = "durnox5",
        .C_COMPONENT_NAME = "quarzel",
        .C_SPARE_1 = 512,
        .C_STATE_INT_WIDTH = 9,
        .C_STATE_FRAC_WIDTH = 3,
        .C_INPUT_INT_WIDTH = 5,
        .C_INPUT_FRAC_WIDTH = 3,
        .C_SPARE_2 = 0,
        .C_SPARE_3 = 0,
        .C_SPARE_4 = 0,
        .C_NUM_PU = 2,
        .C_TAG_WIDTH = 8,
        .C_ALGORITHM_TYPE = 1,
    };
    return generics;
}

const char* vardel_ip_quarzel_check_generics(const vardel_ip_quarzel_generics* record) {
    if (record == nullptr) {
        return "Generics must not be a null pointer";
    }
    const vardel_ip_quarzel_generics& generics = *record;
    if (generics.C_NUM_PU != 2 && generics.C_NUM_PU != 4 && generics.C_NUM_PU != 8) {
        return "C_NUM_PU must be either 2, 4 or 8";
    }
    if (generics.C_TAG_WIDTH < 0 || generics.C_TAG_WIDTH > 32) {
        return "C_TAG_WIDTH must be in range 0 to 32";
    }
    if (generics.C_ALGORITHM_TYPE < 0 || generics.C_ALGORITHM_TYPE > 2) {
        return "C_ALGORITHM_TYPE must be in range 0 to 2";
    }
    if (generics.C_STATE_INT_WIDTH != 9) {
        return "C_STATE_INT_WIDTH must be 9";
    }
    if (generics.C_STATE_FRAC_WIDTH != 3) {
        return "C_STATE_FRAC_WIDTH must be 3";
    }
    if (generics.C_INPUT_INT_WIDTH != 5) {
        return "C_INPUT_INT_WIDTH must be 5";
    }
    if (generics.C_INPUT_FRAC_WIDTH != 3) {
        return "C_INPUT_FRAC_WIDTH must be 3";
    }
    return nullptr;
}

namespace {

/// Create and wire the components of a state.
/// @return the text for the first that failed, or null
const char* fillState(vardel_ip_quarzel_state& state) {
    const int algorithm = state.generics.C_ALGORITHM_TYPE;
    state.state_format = TNumberFormat::create(quarzel::stateFormatProperties);
    if (state.state_format == nullptr) {
        return "Could not set state number format";
    }
    state.branch_format = TNumberFormat::create(quarzel::branchFormatProperties);
    if (state.branch_format == nullptr) {
        return "Could not set branch number format";
    }
    state.input_format = TNumberFormat::create(quarzel::inputFormatProperties);
    if (state.input_format == nullptr) {
        return "Could not set input number format";
    }
    state.interleaver = TInterleaver::create("3GPPLTE");
    if (state.interleaver == nullptr) {
        return "Could not create interleaver";
    }
    state.engine = TCalculationEngine::create(quarzel::engineProperties(algorithm));
    if (state.engine == nullptr) {
        return "Could not create calculation engine";
    }
    state.engine->setMessages(state.messages);
    state.engine->setFormats(state.input_format, state.state_format, state.branch_format);
    if (!state.engine->initialise()) {
        return "Could not initialise calculation engine";
    }
    state.decoder = TDecoder::create("3GPPPU:" + std::to_string(state.generics.C_NUM_PU));
    if (state.decoder == nullptr) {
        return "Could not create decoder";
    }
    state.decoder->connect(state.interleaver, state.engine);
    state.decoder->setExtrinsicScale(quarzel::extrinsicScale(algorithm));
    const auto units = static_cast<unsigned>(state.generics.C_NUM_PU);
    state.lanes = new quarzel::LaneImplementation(units * TDecoder3GPU::defaultThreads, algorithm);
    return nullptr;
}

vardel_ip_quarzel_state* createRecord(const vardel_ip_quarzel_generics& generics, const Messages& messages) {
    void* memory = std::malloc(sizeof(vardel_ip_quarzel_state));
    if (memory == nullptr) {
        decoderError(messages, "Could not allocate memory for decoder state");
        return nullptr;
    }
    auto* state = new (memory) vardel_ip_quarzel_state{};
    state->generics = generics;
    state->messages = messages;
    // The shift count is taken modulo 32, so that a width of 32 gives an empty mask, as a width of 0 does.
    state->tag_mask = (1U << (static_cast<unsigned>(generics.C_TAG_WIDTH) % 32U)) - 1U;
    return state;
}

/// Create a state all of whose lines go to `messages`.
vardel_ip_quarzel_state* createState(const vardel_ip_quarzel_generics* generics, const Messages& messages) {
    if (const char* fault = vardel_ip_quarzel_check_generics(generics)) {
        decoderError(messages, fault);
        return nullptr;
    }
    vardel_ip_quarzel_state* state = createRecord(*generics, messages);
    if (state == nullptr) {
        return nullptr;
    }
    const char* fault = nullptr;
    try {
        fault = fillState(*state);
    } catch (...) {
        fault = "Unhandled exception has occurred";
    }
    if (fault != nullptr) {
        decoderError(messages, fault);
        vardel_ip_quarzel_destroy_state(state);
        return nullptr;
    }
    return state;
}

template <class Component>
void destroy(Component*& component) {
    delete component;
    component = nullptr;
}

}  // namespace

vardel_ip_quarzel_state* create_default_state(vardel_ip_quarzel_generics generics) {
    return createRecord(generics, quarzel::standardStreams);
}

vardel_ip_quarzel_state* vardel_ip_quarzel_create_state(vardel_ip_quarzel_generics generics) {
    return createState(&generics, quarzel::standardStreams);
}

vardel_ip_quarzel_state* vardel_ip_quarzel_create_state_with_messages(
    const vardel_ip_quarzel_generics* generics, vardel_ip_quarzel_message_receiver receiver, void* cookie) {
    return createState(generics, Messages(receiver, cookie));
}

void vardel_ip_quarzel_set_messages(vardel_ip_quarzel_state* state,
                                    vardel_ip_quarzel_message_receiver receiver, void* cookie) {
    state->messages = Messages(receiver, cookie);
}

void vardel_ip_quarzel_destroy_state(vardel_ip_quarzel_state* state) {
    if (state == nullptr) {
        return;
    }
    destroy(state->state_format);
    destroy(state->branch_format);
    destroy(state->input_format);
    destroy(state->engine);
    destroy(state->interleaver);
    destroy(state->decoder);
    destroy(state->passes);
    destroy(state->lanes);
    std::free(state);
}

void vardel_ip_quarzel_bitacc_dump_config(vardel_ip_quarzel_state* state, unsigned int count) {
    if (state->decoder != nullptr) {
        state->decoder->setDump(count);
    }
}
