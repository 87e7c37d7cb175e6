// SPDX-License-Identifier: MIT
#include "draw_loops.hpp"

namespace quarzel::lte {
extern const DrawFunctions avx512Draw = functions;
}
