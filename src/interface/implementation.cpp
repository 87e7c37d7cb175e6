// SPDX-License-Identifier: MIT
// Which implementation decodes, and the choice of another.
#include <new>
#include <string_view>

#include "interface/block_call.hpp"
#include "interface/lane_implementation.hpp"

namespace {

constexpr const char* literal = "literal";

}  // namespace

const char* vardel_ip_quarzel_get_implementation_name(int index) {
    if (index < 0) {
        return nullptr;
    }
    for (const quarzel::lanes::Candidate& candidate : quarzel::lanes::candidates()) {
        if (candidate.supported() && index-- == 0) {
            return candidate.name;
        }
    }
    return index == 0 ? literal : nullptr;
}

const char* vardel_ip_quarzel_get_implementation(const vardel_ip_quarzel_state* state) {
    const bool inLanes = state->lanes != nullptr && state->lanes->choice() != nullptr;
    return inLanes ? state->lanes->choice()->name : literal;
}

int vardel_ip_quarzel_set_implementation(vardel_ip_quarzel_state* state, const char* name) {
    const std::string_view wanted = name == nullptr ? "" : name;
    if (wanted == literal) {
        if (state->lanes != nullptr) {
            state->lanes->choose(nullptr);
        }
        return 0;
    }
    for (const quarzel::lanes::Candidate& candidate : quarzel::lanes::candidates()) {
        if (state->lanes != nullptr && wanted == candidate.name && candidate.supported()) {
            state->lanes->choose(&candidate);
            return 0;
        }
    }
    state->messages.error({"ERROR:decoder:There is no implementation '", wanted, "' on this machine"});
    return 1;
}
