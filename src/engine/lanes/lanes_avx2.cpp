// SPDX-License-Identifier: MIT
#include "engine/lanes/lane_loops.hpp"
#include "engine/lanes/lanes.hpp"

namespace quarzel::lanes {
extern const LaneKernel avx2Kernels[2] = {kernelOf<8>(), kernelOf<16>()};
}
