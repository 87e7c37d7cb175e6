// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>

#include "support/model.hpp"

namespace quarzel::test {

/// The kinds of input of the frozen decisions, in the order of their columns.
enum class FrozenClass : std::uint32_t { noise, fullScale, zero, uniform };
inline constexpr std::array<const char*, 4> frozenClassNames = {"noise", "full_scale", "zero", "uniform"};

/// A core and a block size of the frozen decisions.
struct FrozenCase {
    std::uint32_t K;
    std::uint32_t units;      ///< 2, 4 or 8
    std::uint32_t algorithm;  ///< 0 to 2
};

/// The input of a case. tests/data/README.md defines every value, so that anybody can make it.
Block frozenInput(const FrozenCase& which, FrozenClass kind);

}  // namespace quarzel::test
