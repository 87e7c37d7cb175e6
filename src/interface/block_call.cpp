// SPDX-License-Identifier: MIT
#include "interface/block_call.hpp"

#include <algorithm>
#include <cstdint>
#include <vector>

#include "decoder/decoder.hpp"
#include "interface/lane_implementation.hpp"
#include "interface/literal_call.hpp"
#include "interface/soft_input.hpp"

namespace quarzel {

const char* findFault(const BlockCall& call) {
    if (call.dout == nullptr) {
        return "Simulate called with null pointer for dout";
    }
    if (call.size < 1) {
        return "din_size must be a positive integer";
    }
    if (call.streams[0] == nullptr) {
        return "rsc1_sys must not be a null pointer";
    }
    if (call.streams[1] == nullptr) {
        return "rsc1_par must not be a null pointer";
    }
    if (call.streams[2] == nullptr) {
        return "rsc2_par must not be a null pointer";
    }
    if (call.iterations < 1 || call.iterations > 15) {
        return "Number of iterations must be in the range 1 to 15";
    }
    return nullptr;
}

void decoderError(const Messages& messages, std::string_view text) noexcept {
    messages.error({"ERROR:decoder:", text});
}

int refuse(const Messages& messages, std::string_view text) noexcept {
    decoderError(messages, text);
    return 1;
}

int unhandledException(const Messages& messages) noexcept {
    decoderError(messages, "Unhandled exception has occurred");
    return 99;
}

void reportSaturation(vardel_ip_quarzel_state& state, const BlockCall& call) {
    if (state.saturation_reported != 0) {
        return;
    }
    static constexpr const char* streams[] = {"RSC1 systematic", "RSC1 parity", "RSC2 parity"};
    if (const auto saturation = findSaturation(call, *state.input_format)) {
        const bool written = state.messages.warning(
            {"WARNING:decoder:", streams[saturation->stream], " value in position ",
             Decimal(saturation->position), " saturated ", saturation->positive ? "positively" : "negatively",
             ", further saturation will not be reported"});
        state.saturation_reported = written ? 1 : 0;
    }
}

bool truncates(const vardel_ip_quarzel_state& state, unsigned tag) {
    return (tag & state.tag_mask) != tag && state.tag_truncation_reported == 0;
}

void reportTruncation(vardel_ip_quarzel_state& state, unsigned tag) {
    if (truncates(state, tag)) {
        const bool written = state.messages.warning({"WARNING:decoder:Input block tag has been truncated to ",
                                                     Decimal(state.generics.C_TAG_WIDTH),
                                                     " bits, further truncation will not be reported"});
        state.tag_truncation_reported = written ? 1 : 0;
    }
}

namespace {

/// Decode a block step by step.
Outcome decodeLiterally(vardel_ip_quarzel_state& state, const BlockCall& call) {
    LiteralCall literal(state, call);
    reportSaturation(state, call);
    std::vector<short> soft;
    toSoftValues(call, *state.input_format, *state.state_format, soft);
    std::vector<unsigned char> hard;
    if (!state.decoder->decode(soft, hard, static_cast<unsigned>(call.iterations))) {
        return {2};
    }
    if (!hasRoom(call, hard.size())) {
        return {refuse(state.messages, "Insufficient allocated space for output array")};
    }
    literal.writeIterations(call);
    std::copy(hard.begin(), hard.end(), call.dout + (call.iterations - 1) * call.iterationStride);
    return {0, hard.size()};
}

/// Whether the decisions of a block are written where its soft values stand.
bool overwritesInputs(const BlockCall& call) {
    const auto addressOf = [](const void* place) { return reinterpret_cast<std::uintptr_t>(place); };
    const std::size_t bytes = static_cast<std::size_t>(call.size) * static_cast<std::size_t>(call.valueType);
    return std::any_of(std::begin(call.streams), std::end(call.streams), [&](const void* stream) {
        return addressOf(stream) < addressOf(call.dout) + blockSize(call) &&
               addressOf(call.dout) < addressOf(stream) + bytes;
    });
}

/// Decode a block in lanes. They notice whether a value is saturated while they decode; the value is looked
/// for when one was.
Outcome decodeInLanes(vardel_ip_quarzel_state& state, const BlockCall& call) {
    if (overwritesInputs(call)) {
        reportSaturation(state, call);
    }
    const LaneBlock block{{call.streams[0], call.streams[1], call.streams[2]}, call.dout};
    const LaneCall laneCall{{&block, 1},
                            static_cast<std::size_t>(call.valueType),
                            static_cast<unsigned>(call.iterations),
                            call.iterationStride};
    if (state.lanes->decode(state, blockSize(call), laneCall)) {
        reportSaturation(state, call);
    }
    return {0, blockSize(call)};
}

}  // namespace

Outcome decodeBlock(vardel_ip_quarzel_state& state, const BlockCall& call) {
    if (state.decoder == nullptr) {  // a record that nobody has filled
        return {unhandledException(state.messages)};
    }
    try {
        if (call.positionStride == 1 && hasRoom(call, blockSize(call)) &&
            takesLanes(state, blockSize(call))) {
            return decodeInLanes(state, call);
        }
        return decodeLiterally(state, call);
    } catch (...) {
        reportSaturation(state, call);
        return {unhandledException(state.messages)};
    }
}

}  // namespace quarzel
