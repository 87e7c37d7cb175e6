// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "outcome.hpp"

namespace quarzel::bindings {

/// @throws BindingError unless all bits are 0 or 1
void requireBits(std::span<const std::uint8_t> bits);

/// Encode blocks of one size.
/// @param bits    K information bits a block, each 0 or 1
/// @param K       one of the 188 sizes
/// @param blocks  how many there are
/// @param code    receives 3 (K + 4) code bits a block: systematic, parity 1, parity 2, each with its tail
Outcome encode(const std::uint8_t* bits, std::size_t K, std::size_t blocks, std::uint8_t* code) noexcept;

}  // namespace quarzel::bindings
