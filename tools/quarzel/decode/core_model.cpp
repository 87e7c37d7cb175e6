// SPDX-License-Identifier: MIT
#include "decode/core_model.hpp"

#include <algorithm>

#include "tool_error.hpp"
#include "trace/trace_decoder.hpp"

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

std::optional<FailedBlock> CoreModel::decode(std::span<const SoftBlock> blocks, int iterations,
                                             std::span<unsigned char> bits) {
    const std::size_t bitsPerBlock = bits.size() / blocks.size();
    itsInputs.clear();
    itsOutputs.clear();
    for (const SoftBlock& block : blocks) {
        const std::size_t positions = block.size() / 3;
        itsInputs.push_back({block.data(), block.data() + positions, block.data() + 2 * positions,
                             static_cast<int>(positions), iterations, 0});
        itsOutputs.push_back(
            {bits.data() + itsOutputs.size() * bitsPerBlock, static_cast<int>(bitsPerBlock), 0, 0});
    }
    itsStatuses.resize(blocks.size());
    const int status =
        vardel_ip_quarzel_bitacc_simulate_batch(itsState.get(), itsOutputs.data(), itsInputs.data(),
                                                static_cast<int>(blocks.size()), itsStatuses.data());
    if (status == 0) {
        return std::nullopt;
    }
    const auto failed = std::find(itsStatuses.begin(), itsStatuses.end(), status);
    return FailedBlock{static_cast<std::size_t>(failed - itsStatuses.begin()), status};
}

}  // namespace quarzel::tool
