// SPDX-License-Identifier: MIT
#include "engine/lanes/lane_loops.hpp"
#include "engine/lanes/lanes.hpp"

namespace quarzel::lanes {
extern const LaneKernel sse41Kernels[1] = {kernelOf<8>()};
}
