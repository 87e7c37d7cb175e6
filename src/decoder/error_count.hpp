// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstddef>
#include <vector>

namespace quarzel {

/// Bit errors of decided values against the bits that were sent: the positions of the common length where
/// they differ, and every entry by which either is longer.
///
/// @param decide  tells whether a value stands for a 1
template <class Value, class Decide>
unsigned long long countErrors(const std::vector<unsigned char>& reference, const std::vector<Value>& values,
                               Decide decide) {
    const auto [shorter, longer] = std::minmax({reference.size(), values.size()});
    unsigned long long errors = longer - shorter;
    for (std::size_t i = 0; i < shorter; ++i) {
        errors += (reference[i] != 0) != decide(values[i]) ? 1 : 0;
    }
    return errors;
}

}  // namespace quarzel
