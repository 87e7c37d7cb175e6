// SPDX-License-Identifier: MIT
#include "link/draw/draw_loops.hpp"
#include "link/draw/search_avx512.hpp"

namespace quarzel::link {
extern const DrawFunctions avx512Draw = {drawWords, lookUp, search};
}
