// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>

#include "quarzel/code.hpp"

namespace quarzel::tool {

/// The branches of the trellis as tables, of bit 1 and bit 0.
struct TrellisTable {
    using States = std::array<std::size_t, encoderStates>;

    std::array<States, 2> target{};  ///< [bit][state before]
    std::array<States, 2> source{};  ///< [bit][state after]
    States column{};                 ///< of the branch metric that both branches of a state carry

    TrellisTable() {
        for (unsigned state = 0; state < encoderStates; ++state) {
            for (const unsigned bit : {0U, 1U}) {
                const Branch found = branch(state, bit);
                target[bit][state] = found.to;
                source[bit][found.to] = state;
                column[state] = found.metric - 4;
            }
        }
    }
};

}  // namespace quarzel::tool
