// SPDX-License-Identifier: MIT
#include "engine/lanes/lane_loops.hpp"
#include "engine/lanes/lanes.hpp"

namespace quarzel::lanes {
extern const LaneKernel baselineKernels[1] = {kernelOf<8>()};
}
