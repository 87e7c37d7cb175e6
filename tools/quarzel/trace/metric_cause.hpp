// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "trace/step_inputs.hpp"

namespace quarzel::tool {

/// Say what a state metric that differs should have been, and whether B has what a likely fault gives.
/// @param inputs     of the difference
/// @param sentences  holds what was said before; the last one goes on, others follow
/// @throws MissingInput
void explainMetric(const TraceDifference& difference, StepInputs& inputs,
                   std::vector<std::string>& sentences);

}  // namespace quarzel::tool
