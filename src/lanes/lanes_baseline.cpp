// SPDX-License-Identifier: MIT
#include "lanes/lane_loops.hpp"
#include "lanes/lanes.hpp"

namespace quarzel::lanes {
extern const LaneKernel baselineKernels[1] = {kernelOf<8>()};
}
