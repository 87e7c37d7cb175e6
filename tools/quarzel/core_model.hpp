// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <vector>

#include "capture_file.hpp"
#include "vardel_ip_quarzel.h"

namespace quarzel::tool {

class TraceWriter;

/// One configured core, behind the C interface.
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

    /// Decode a block.
    /// @param bits  its K entries receive the decisions, 0 or 1
    /// @return      the status of the library; when it is not 0, the library has said why
    int decode(const SoftBlock& block, int iterations, std::vector<unsigned char>& bits);

  private:
    struct Destroy {
        void operator()(vardel_ip_quarzel_state* state) const { vardel_ip_quarzel_destroy_state(state); }
    };
    std::unique_ptr<vardel_ip_quarzel_state, Destroy> itsState;
};

}  // namespace quarzel::tool
