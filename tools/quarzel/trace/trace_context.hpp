// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "trace/trace_comparison.hpp"

namespace quarzel::tool {

/// Append the signal that differs around the step where it does, in units of 1/8: a row of A and one of B for
/// each step, with '*' before the values of B that differ.
void appendContext(std::string& text, const TraceDifference& difference);

}  // namespace quarzel::tool
