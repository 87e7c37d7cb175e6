// SPDX-License-Identifier: MIT
#include "dpi_logic.hpp"

#include <algorithm>
#include <string>

#include "common/outcome.hpp"

namespace quarzel::dpi {

using namespace quarzel::bindings;

namespace {

/// A bit of a four-state word as a simulator prints it.
char bitOf(const svLogicVecVal& word, int position) {
    const unsigned value = word.aval >> position & 1U;
    const unsigned unknown = word.bval >> position & 1U;
    return "01zx"[2 * unknown + value];
}

/// The bits of a word without those that repeat the sign, but never fewer than a soft value has.
std::string bitsOf(const svLogicVecVal& word) {
    constexpr int softValueBits = 8;
    int width = 32;
    while (width > softValueBits && bitOf(word, width - 1) == bitOf(word, width - 2)) {
        --width;
    }
    std::string text;
    for (int position = width - 1; position >= 0; --position) {
        text += bitOf(word, position);
    }
    return text;
}

}  // namespace

std::vector<std::int32_t> knownValues(const svLogicVecVal* words, std::size_t positions, const char* name) {
    std::vector<std::int32_t> values(positions);
    std::transform(words, words + positions, values.begin(), [&](const svLogicVecVal& word) {
        if (word.bval != 0) {
            throw BindingError(Fault::value, std::string(name) + " is " + bitsOf(word) + " in position " +
                                                 std::to_string(&word - words) +
                                                 "; drive every bit with 0 or 1");
        }
        return static_cast<std::int32_t>(word.aval);
    });
    return values;
}

}  // namespace quarzel::dpi
