// SPDX-License-Identifier: MIT
#pragma once

#include "vectors/vector_blocks.hpp"
#include "vectors/vector_plan.hpp"

namespace quarzel::tool {

/// What the manifest and reports call blocks of a capture.
constexpr const char* capturedStimulus = "capture";

/// The blocks of the request's capture, all of them with each of its iterations in turn. Soft values are
/// saturated as a core does it.
CoreStimulus capturedBlocks(const VectorRequest& request);

}  // namespace quarzel::tool
