// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "trace/trace_comparison.hpp"

namespace quarzel::tool {

/// Say what a value that differs should have been: recompute it of the inputs that its step has in A, and
/// tell whether B has the same inputs.
/// @return sentences for people; empty for what no core computes
std::vector<std::string> causeOf(const TraceDifference& difference);

}  // namespace quarzel::tool
