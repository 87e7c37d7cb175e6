// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>

#include "engine/steps.hpp"

namespace quarzel {

/// The soft values of the three termination steps of a constituent code, in order.
template <class Word>
struct TailValues {
    std::array<Word, 3> systematic;
    std::array<Word, 3> parity0;
    std::array<Word, 3> parity1;
};

/// The backward metrics below the termination, as the core forms them: the sums along the three steps from
/// each state to state 0. The low bits that a boundary metric does not have are still there.
template <class Word>
constexpr StateWords<Word> tailMetrics(const TailValues<Word>& tail) {
    // Value of a termination step with the signs of its two parities.
    const auto value = [&tail](std::size_t step, int sign0, int sign1) {
        const auto signedSum = [](Word x, Word y, int sign) { return sign > 0 ? add(x, y) : sub(x, y); };
        return signedSum(signedSum(tail.systematic[step], tail.parity0[step], sign0), tail.parity1[step],
                         sign1);
    };
    const Word T = value(2, 1, 1);
    const Word U2 = value(1, 1, 1);
    const Word V2 = value(1, -1, 1);
    const Word U1 = value(0, 1, 1);
    const Word W1 = value(0, 1, -1);
    const Word V1 = value(0, -1, 1);
    const Word X1 = value(0, -1, -1);
    const Word minusTU = sub(sub(Word{}, T), U2);
    return {sub(minusTU, U1),    add(minusTU, U1),      // from states 0 and 1
            add(sub(U2, T), V1), sub(sub(U2, T), V1),   // 2 and 3
            sub(add(T, V2), X1), add(add(T, V2), X1),   // 4 and 5
            add(sub(T, V2), W1), sub(sub(T, V2), W1)};  // 6 and 7
}

}  // namespace quarzel
