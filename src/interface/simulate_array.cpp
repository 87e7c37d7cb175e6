// SPDX-License-Identifier: MIT
#include "interface/grouped_calls.hpp"

namespace quarzel {

namespace {

/// The blocks of an array.
class ArraySource {
  public:
    ArraySource(const vardel_ip_quarzel_array_outputs& outputs, const vardel_ip_quarzel_array_inputs& inputs)
        : itsOutputs(outputs), itsInputs(inputs) {}

    BlockCall block(int index) const {
        constexpr int boundless = -1;
        const std::ptrdiff_t offset = index * itsInputs.block_stride * itsInputs.value_type;
        const auto at = [offset](const void* first) -> const void* {
            return first == nullptr ? nullptr : static_cast<const unsigned char*>(first) + offset;
        };
        return {{at(itsInputs.rsc1_sys), at(itsInputs.rsc1_par), at(itsInputs.rsc2_par)},
                itsInputs.position_stride,
                itsInputs.value_type,
                itsInputs.din_size,
                itsInputs.iterations,
                itsInputs.tags == nullptr ? 0 : itsInputs.tags[index],
                itsOutputs.dout == nullptr ? nullptr : itsOutputs.dout + index * itsOutputs.block_stride,
                boundless,
                itsOutputs.iteration_stride};
    }

    void finish(int index, std::size_t /*bits*/, unsigned tag) const {
        if (itsOutputs.tags != nullptr) {
            itsOutputs.tags[index] = tag;
        }
    }

  private:
    const vardel_ip_quarzel_array_outputs& itsOutputs;
    const vardel_ip_quarzel_array_inputs& itsInputs;
};

}  // namespace

}  // namespace quarzel

int vardel_ip_quarzel_bitacc_simulate_array(vardel_ip_quarzel_state* state,
                                            const vardel_ip_quarzel_array_outputs* outputs,
                                            const vardel_ip_quarzel_array_inputs* inputs, int* statuses) {
    using quarzel::refuse;
    if (state == nullptr) {
        return refuse(quarzel::standardStreams, "Simulate array called with null state structure");
    }
    if (outputs == nullptr) {
        return refuse(state->messages, "Simulate array called with null output structure");
    }
    if (inputs == nullptr) {
        return refuse(state->messages, "Simulate array called with null input structure");
    }
    if (inputs->value_type != VARDEL_IP_QUARZEL_INT8 && inputs->value_type != VARDEL_IP_QUARZEL_INT16 &&
        inputs->value_type != VARDEL_IP_QUARZEL_INT32) {
        return refuse(state->messages,
                      "value_type must be VARDEL_IP_QUARZEL_INT8, VARDEL_IP_QUARZEL_INT16 or "
                      "VARDEL_IP_QUARZEL_INT32");
    }
    if (inputs->count < 0) {
        return refuse(state->messages, "count must not be negative");
    }
    return quarzel::simulateAll(*state, quarzel::ArraySource(*outputs, *inputs), inputs->count, statuses);
}
