// SPDX-License-Identifier: MIT
#include "engine/lanes/lane_loops.hpp"
#include "engine/lanes/lanes.hpp"

namespace quarzel::lanes {
extern const LaneKernel avx512bwKernels[3] = {kernelOf<8>(), kernelOf<16>(), kernelOf<32>()};
}
