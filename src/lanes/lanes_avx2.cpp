// SPDX-License-Identifier: MIT
#include "lanes/lane_loops.hpp"
#include "lanes/lanes.hpp"

namespace quarzel::lanes {
extern const LaneKernel avx2Kernels[2] = {kernelOf<8>(), kernelOf<16>()};
}
