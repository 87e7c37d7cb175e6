// SPDX-License-Identifier: MIT
#include "link/draw/draw_loops.hpp"

namespace quarzel::link {
extern const DrawFunctions baselineDraw = {drawWords, lookUp, nullptr};
}
