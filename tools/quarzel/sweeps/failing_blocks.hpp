// SPDX-License-Identifier: MIT
#pragma once

#include <map>
#include <vector>

#include "sweep/run.hpp"

namespace quarzel::tool {

/// The first failing blocks of points, in ascending order of their numbers.
using FailingBlocks = std::map<sweep::Setup, std::vector<sweep::FailingBlock>>;

/// The first failing blocks of all points of a result, as many of each as the plan of its sweep keeps. They
/// do not depend on who simulated what when: those of points that were known before, or went on from there,
/// are looked for again, from the first block on.
/// @param points      of the result, with those that the dispatcher has simulated
/// @param dispatcher  has finished
/// @param workers  that look
/// @throws ToolError when a signal comes
FailingBlocks failingBlocksOf(const sweep::Points& points, const sweep::Dispatcher& dispatcher,
                              sweep::Workers& workers);

}  // namespace quarzel::tool
