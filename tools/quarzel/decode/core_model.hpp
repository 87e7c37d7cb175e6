// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <span>
#include <vector>

#include "captures/capture_file.hpp"
#include "vardel_ip_quarzel.h"

namespace quarzel::tool {

class TraceWriter;

/// A block that the library did not decode; it has said why.
struct FailedBlock {
    std::size_t index;  ///< among the blocks of the call
    int status;
};

/// One configured core, behind the C interface.
///
/// Thread rule: one thread at a time.
class CoreModel {
  public:
    /// @param units      processing units: 2, 4 or 8
    /// @param algorithm  0 max-log, 1 max-log with scaling, 2 max-star
    /// @param trace      receives the traces; not owned, must outlive the model. Null when there are to be
    /// none
    /// @throws ToolError when the library makes no model; it has said why
    CoreModel(int units, int algorithm, TraceWriter* trace = nullptr);

    /// Trace the next `passes` passes.
    void trace(unsigned passes) { vardel_ip_quarzel_bitacc_dump_config(itsState.get(), passes); }

    /// Decode blocks of one size, together.
    /// @param bits  receives the decisions, 0 or 1: K a block, one block after the other
    /// @return      the first block that failed, if one did
    std::optional<FailedBlock> decode(std::span<const SoftBlock> blocks, int iterations,
                                      std::span<unsigned char> bits);

  private:
    struct Destroy {
        void operator()(vardel_ip_quarzel_state* state) const { vardel_ip_quarzel_destroy_state(state); }
    };
    std::unique_ptr<vardel_ip_quarzel_state, Destroy> itsState;
    std::vector<vardel_ip_quarzel_inputs> itsInputs;
    std::vector<vardel_ip_quarzel_outputs> itsOutputs;
    std::vector<int> itsStatuses;
};

}  // namespace quarzel::tool
