// SPDX-License-Identifier: MIT
#include "link/draw/draw_loops.hpp"
#include "link/draw/draw_words_avx512.hpp"
#include "link/draw/search_avx512.hpp"

namespace quarzel::link {
extern const DrawFunctions avx512Draw = {drawWordsAvx512, lookUp, search};
}
