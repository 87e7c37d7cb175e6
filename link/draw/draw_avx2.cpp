// SPDX-License-Identifier: MIT
#include "link/draw/draw_loops.hpp"

namespace quarzel::link {
extern const DrawFunctions avx2Draw = {drawWords, lookUp, nullptr};
}
