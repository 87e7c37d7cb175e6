// SPDX-License-Identifier: MIT
#include "core_model.hpp"

#include "tool_error.hpp"
#include "trace_decoder.hpp"

namespace quarzel::tool {

CoreModel::CoreModel(int units, int algorithm, TraceWriter* trace) {
    vardel_ip_quarzel_generics generics;
    vardel_ip_quarzel_get_default_generics(&generics);
    generics.C_NUM_PU = units;
    generics.C_ALGORITHM_TYPE = algorithm;
    itsState.reset(vardel_ip_quarzel_create_state(generics));
    if (itsState == nullptr) {
        throw ToolError(ExitCode::decodingFailed, "", "no model of the core could be made",
                        "the line above says why");
    }
    if (trace != nullptr) {
        traceTo(*trace, *itsState);
    }
}

int CoreModel::decode(const SoftBlock& block, int iterations, std::vector<unsigned char>& bits) {
    const std::size_t positions = block.size() / 3;
    vardel_ip_quarzel_inputs inputs{};
    inputs.rsc1_sys = block.data();
    inputs.rsc1_par = block.data() + positions;
    inputs.rsc2_par = block.data() + 2 * positions;
    inputs.din_size = static_cast<int>(positions);
    inputs.iterations = iterations;
    vardel_ip_quarzel_outputs outputs{};
    outputs.dout = bits.data();
    outputs.dout_alloc_size = static_cast<int>(bits.size());
    return vardel_ip_quarzel_bitacc_simulate(itsState.get(), &outputs, inputs);
}

}  // namespace quarzel::tool
