// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

namespace quarzel::test {

using Permutation = std::vector<std::uint32_t>;

/// The permutation polynomial (f1 i + f2 i^2) mod K, multiplied out in 64 bits.
inline Permutation closedForm(std::uint64_t K, std::uint64_t f1, std::uint64_t f2) {
    Permutation permutation;
    for (std::uint64_t i = 0; i < K; ++i) {
        permutation.push_back(static_cast<std::uint32_t>((f1 * i + f2 * i * i) % K));
    }
    return permutation;
}

}  // namespace quarzel::test
