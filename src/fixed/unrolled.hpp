// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <type_traits>
#include <utility>

namespace quarzel {

/// Call `body` with the constants 0 to Count - 1. The loop is gone before the optimiser sees it, so that
/// arrays indexed by the constants can live in registers.
template <std::size_t Count, class Body>
constexpr void unrolled(Body&& body) {
    [&]<std::size_t... I>(std::index_sequence<I...>) {
        (body(std::integral_constant<std::size_t, I>{}), ...);
    }
    (std::make_index_sequence<Count>{});
}

}  // namespace quarzel
