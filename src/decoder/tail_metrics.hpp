// SPDX-License-Identifier: MIT
#pragma once

#include <array>

#include "engine/t8.hpp"
#include "fixed/wrap16.hpp"

namespace quarzel {

/// The soft values of the three termination steps of a constituent code, in order.
struct TailValues {
    std::array<std::int16_t, 3> systematic;
    std::array<std::int16_t, 3> parity0;
    std::array<std::int16_t, 3> parity1;
};

/// The backward metrics below the termination, as the core forms them: the sums along the three steps from
/// each state to state 0, as boundary metrics.
constexpr T8 tailMetrics(const TailValues& tail) {
    // Value of a termination step with the signs of its two parities.
    const auto value = [&tail](std::size_t step, int sign0, int sign1) {
        return tail.systematic[step] + sign0 * tail.parity0[step] + sign1 * tail.parity1[step];
    };
    const std::int32_t T = value(2, 1, 1);
    const std::int32_t U2 = value(1, 1, 1);
    const std::int32_t V2 = value(1, -1, 1);
    const std::int32_t U1 = value(0, 1, 1);
    const std::int32_t W1 = value(0, 1, -1);
    const std::int32_t V1 = value(0, -1, 1);
    const std::int32_t X1 = value(0, -1, -1);
    // The sums fit 32 bits, so that one wrap at the end is the wrap of every step.
    const std::int32_t sums[8] = {-T - U2 - U1, -T - U2 + U1, U2 - T + V1, U2 - T - V1,
                                  T + V2 - X1,  T + V2 + X1,  T - V2 + W1, T - V2 - W1};
    T8 metrics{};
    for (std::size_t state = 0; state < 8; ++state) {
        metrics[state] = static_cast<std::int16_t>(wrap16(sums[state]) & boundaryMask);
    }
    return metrics;
}

}  // namespace quarzel
