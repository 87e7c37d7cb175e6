// SPDX-License-Identifier: MIT
#include "lanes/lane_loops.hpp"
#include "lanes/lanes.hpp"

namespace quarzel::lanes {
extern const LaneKernel avx512bwKernels[3] = {kernelOf<8>(), kernelOf<16>(), kernelOf<32>()};
}
