// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

namespace quarzel::link {

/// How many of `count` decisions, bytes of 0 or 1, differ from bit `lane` of the byte that was sent. Pure.
std::uint32_t bitErrors(const std::uint8_t* sent, unsigned lane, const std::uint8_t* decisions,
                        std::size_t count);

}  // namespace quarzel::link
